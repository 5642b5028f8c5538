#include "broker/Block_Memory.h"

#include "broker/Nameless_File.h"

#include <algorithm>
#include <cstdint>
#include <fcntl.h>
#include <new>
#include <sys/mman.h>
#include <unistd.h>

namespace KPRV::broker {

namespace {

constexpr std::size_t SIZE = Block_Memory::BLOCK_SIZE;

/// Reserves more than is needed, and gives back what stands before and behind.
char* map_aligned(int file, off_t offset)
{
    void* const room = mmap(nullptr, 2 * SIZE, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (room == MAP_FAILED)
        return nullptr;
    char* const begin = static_cast<char*>(room);
    const std::size_t before = (SIZE - reinterpret_cast<std::uintptr_t>(begin) % SIZE) % SIZE;
    char* const block = begin + before;
    if (before)
        munmap(begin, before);
    munmap(block + SIZE, SIZE - before);
    const int kind = file < 0 ? MAP_PRIVATE | MAP_ANONYMOUS : MAP_SHARED;
    if (mmap(block, SIZE, PROT_READ | PROT_WRITE, kind | MAP_FIXED, file, offset) != MAP_FAILED)
        return block;
    munmap(block, SIZE);
    return nullptr;
}

} // namespace

Block_Memory::~Block_Memory()
{
    if (_file >= 0)
        close(_file);
}

off_t Block_Memory::place_in_file()
{
    if (_file < 0 && !_has_no_file) {
        _file = nameless_file();
        _has_no_file = _file < 0;
    }
    if (_has_no_file)
        return -1;
    const off_t place = _free_places.empty() ? _file_end : _free_places.back();
    if (posix_fallocate(_file, place, SIZE) != 0)
        return -1;
    if (_free_places.empty())
        _file_end += static_cast<off_t>(SIZE);
    else
        _free_places.pop_back();
    return place;
}

void Block_Memory::take(Block& block)
{
    const Auto_Lock lock(_mutex);
    _free_places.reserve(static_cast<std::size_t>(_file_end) / SIZE + 1);
    block.offset = _most_blocks && _in_memory >= _most_blocks ? place_in_file() : -1;
    block.begin = map_aligned(block.offset < 0 ? -1 : _file, block.offset < 0 ? 0 : block.offset);
    if (!block.begin) {
        if (block.offset >= 0)
            _free_places.push_back(block.offset);
        throw std::bad_alloc();
    }
    block.is_here = true;
    if (block.offset < 0)
        ++_in_memory;
    else
        note_here(block);
}

void Block_Memory::give(Block& block)
{
    const Auto_Lock lock(_mutex);
    munmap(block.begin, SIZE);
    if (block.offset < 0) {
        --_in_memory;
        return;
    }
    std::erase(_here, &block);
    fallocate(_file, FALLOC_FL_PUNCH_HOLE | FALLOC_FL_KEEP_SIZE, block.offset, SIZE);
    _free_places.push_back(block.offset);
}

void Block_Memory::come_in(Block& block)
{
    const Auto_Lock lock(_mutex);
    if (!block.is_here.exchange(true))
        note_here(block);
}

void Block_Memory::note_here(Block& block)
{
    _here.push_back(&block);
    if (_here.size() <= _most_blocks)
        return;
    Block& oldest = *_here.front();
    _here.erase(_here.begin());
    oldest.is_here = false;
    // The pages go, what stands in them stays in the file.
    madvise(oldest.begin, SIZE, MADV_DONTNEED);
}

std::size_t Block_Memory::in_file() const
{
    const Auto_Lock lock(_mutex);
    return static_cast<std::size_t>(_file_end) - _free_places.size() * SIZE;
}

} // namespace KPRV::broker
