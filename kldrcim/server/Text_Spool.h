#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <string>
#include <sys/types.h>

namespace KPRV::kldrcim {

/// Texts that wait, the oldest first, however many there are: what does not fit into memory lies in a file
/// without a name. For one thread at a time.
class Text_Spool
{
public:
    static constexpr std::size_t MOST_IN_MEMORY = std::size_t(1) << 20;

    explicit Text_Spool(std::size_t most_in_memory = MOST_IN_MEMORY) : _most_in_memory(most_in_memory) {}
    ~Text_Spool();
    Text_Spool(const Text_Spool&) = delete;
    Text_Spool& operator=(const Text_Spool&) = delete;

    /// Throws `std::system_error` if the file takes no more; where there can be none, all lies in memory.
    void put(std::string&& text);
    /// The oldest, of which there must be one. Throws `std::system_error` if the file cannot be read.
    std::string take();

    std::size_t size() const { return _in_memory.size() + _in_file.size(); }
    /// Of the file.
    off_t file_bytes() const { return _written - _taken; }

private:
    /// False if there is none.
    bool has_file();

    const std::size_t _most_in_memory;
    std::deque<std::string> _in_memory;
    std::size_t _bytes = 0;
    /// The lengths of those in the file, which are all younger.
    std::deque<std::uint32_t> _in_file;
    off_t _taken = 0;
    off_t _written = 0;
    int _file = -1;
    bool _has_no_file = false;
};

} // namespace KPRV::kldrcim
