#include "kldrcim/server/Body_Pipe.h"

namespace KPRV::kldrcim {

bool Body_Pipe::send(std::string&& text)
{
    const Auto_Lock lock(_mutex);
    while (_bytes >= MOST_BYTES && !_closed)
        _changed.wait(_mutex);
    if (_closed)
        return false;
    _bytes += text.size();
    _pieces.push_back(std::move(text));
    _changed.notify_all();
    return true;
}

void Body_Pipe::allow_status()
{
    const Auto_Lock lock(_mutex);
    _takes_status = true;
}

bool Body_Pipe::take_status(CMPIrc rc, const std::string& text)
{
    const Auto_Lock lock(_mutex);
    if (_takes_status)
        _status = {rc, text};
    return _takes_status;
}

Body_Pipe::Status Body_Pipe::status() const
{
    const Auto_Lock lock(_mutex);
    return _status;
}

void Body_Pipe::finish(bool broken)
{
    const Auto_Lock lock(_mutex);
    _finished = true;
    _broken = broken;
    _changed.notify_all();
}

void Body_Pipe::close()
{
    const Auto_Lock lock(_mutex);
    _closed = true;
    _changed.notify_all();
}

void Body_Pipe::wait_for_piece()
{
    while (_pieces.empty() && !_finished && !_closed)
        _changed.wait(_mutex);
}

bool Body_Pipe::wait()
{
    const Auto_Lock lock(_mutex);
    wait_for_piece();
    return !_pieces.empty();
}

std::size_t Body_Pipe::read(char* to, std::size_t size)
{
    const Auto_Lock lock(_mutex);
    wait_for_piece();
    if (_pieces.empty())
        return 0;
    const std::string& piece = _pieces.front();
    const std::size_t count = piece.copy(to, size, _taken);
    _taken += count;
    _bytes -= count;
    if (_taken == piece.size()) {
        _pieces.pop_front();
        _taken = 0;
    }
    _changed.notify_all();
    return count;
}

bool Body_Pipe::is_broken() const
{
    const Auto_Lock lock(_mutex);
    return _broken || _closed;
}

} // namespace KPRV::kldrcim
