#include "kldrcim/server/Text_Spool.h"

#include "broker/Nameless_File.h"

#include <cerrno>
#include <system_error>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

[[noreturn]] void fail(const char* what, int number)
{
    throw std::system_error(number, std::generic_category(), what);
}

/// All of it, there, by `pread` or `pwrite`.
template <class Call, class Data>
void move_all(Call call, int file, Data* data, std::size_t size, off_t at, const char* what)
{
    while (size != 0) {
        const ssize_t moved = call(file, data, size, at);
        if (moved < 0 && errno == EINTR)
            continue;
        if (moved <= 0)
            fail(what, moved < 0 ? errno : EIO);
        data += moved;
        size -= static_cast<std::size_t>(moved);
        at += moved;
    }
}

} // namespace

Text_Spool::~Text_Spool()
{
    if (_file >= 0)
        ::close(_file);
}

bool Text_Spool::has_file()
{
    if (_file < 0 && !_has_no_file)
        _file = broker::nameless_file();
    _has_no_file = _file < 0;
    return !_has_no_file;
}

void Text_Spool::put(std::string&& text)
{
    const bool fits = _in_file.empty() && _bytes + text.size() <= _most_in_memory;
    if (fits || (_in_file.empty() && !has_file())) {
        _bytes += text.size();
        _in_memory.push_back(std::move(text));
        return;
    }
    move_all(::pwrite, _file, text.data(), text.size(), _written, "what waits to be pulled");
    _in_file.push_back(static_cast<std::uint32_t>(text.size()));
    _written += static_cast<off_t>(text.size());
}

std::string Text_Spool::take()
{
    std::string text;
    if (!_in_memory.empty()) {
        text = std::move(_in_memory.front());
        _in_memory.pop_front();
        _bytes -= text.size();
        return text;
    }
    text.resize(_in_file.front());
    move_all(::pread, _file, text.data(), text.size(), _taken, "what waits to be pulled");
    _in_file.pop_front();
    _taken += static_cast<off_t>(text.size());
    // From its beginning again: a file that never empties grows for ever.
    if (_in_file.empty() && ftruncate(_file, 0) == 0)
        _taken = _written = 0;
    return text;
}

} // namespace KPRV::kldrcim
