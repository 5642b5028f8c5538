#include "broker/Block_Memory.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <fcntl.h>
#include <new>
#include <string>
#include <sys/mman.h>
#include <unistd.h>

namespace KPRV::broker {

namespace {

constexpr std::size_t size = Block_Memory::block_size;

/// Negative if the folder takes none.
int nameless_file()
{
    const char* const named = std::getenv("TMPDIR");
    const std::string folder = named && *named ? named : "/var/tmp";
    const int file = open(folder.c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, 0600);
    if (file >= 0)
        return file;
    // Not every file system can make one without a name.
    std::string name = folder + "/kldrcim-XXXXXX";
    const int named_file = mkostemp(name.data(), O_CLOEXEC);
    if (named_file >= 0)
        unlink(name.c_str());
    return named_file;
}

/// Reserves more than is needed, and gives back what stands before and behind.
char* map_aligned(int file, off_t offset)
{
    void* const room = mmap(nullptr, 2 * size, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (room == MAP_FAILED)
        return nullptr;
    char* const begin = static_cast<char*>(room);
    const std::size_t before = (size - reinterpret_cast<std::uintptr_t>(begin) % size) % size;
    char* const block = begin + before;
    if (before)
        munmap(begin, before);
    munmap(block + size, size - before);
    const int kind = file < 0 ? MAP_PRIVATE | MAP_ANONYMOUS : MAP_SHARED;
    if (mmap(block, size, PROT_READ | PROT_WRITE, kind | MAP_FIXED, file, offset) != MAP_FAILED)
        return block;
    munmap(block, size);
    return nullptr;
}

} // namespace

Block_Memory::~Block_Memory()
{
    if (file_ >= 0)
        close(file_);
}

off_t Block_Memory::place_in_file()
{
    if (file_ < 0 && !has_no_file_) {
        file_ = nameless_file();
        has_no_file_ = file_ < 0;
    }
    if (has_no_file_)
        return -1;
    const off_t place = free_places_.empty() ? file_end_ : free_places_.back();
    if (posix_fallocate(file_, place, size) != 0)
        return -1;
    if (free_places_.empty())
        file_end_ += static_cast<off_t>(size);
    else
        free_places_.pop_back();
    return place;
}

void Block_Memory::take(Block& block)
{
    const Auto_Lock lock(mutex_);
    free_places_.reserve(static_cast<std::size_t>(file_end_) / size + 1);
    block.offset = most_blocks_ && in_memory_ >= most_blocks_ ? place_in_file() : -1;
    block.begin = map_aligned(block.offset < 0 ? -1 : file_, block.offset < 0 ? 0 : block.offset);
    if (!block.begin) {
        if (block.offset >= 0)
            free_places_.push_back(block.offset);
        throw std::bad_alloc();
    }
    block.is_here = true;
    if (block.offset < 0)
        ++in_memory_;
    else
        note_here(block);
}

void Block_Memory::give(Block& block)
{
    const Auto_Lock lock(mutex_);
    munmap(block.begin, size);
    if (block.offset < 0) {
        --in_memory_;
        return;
    }
    std::erase(here_, &block);
    fallocate(file_, FALLOC_FL_PUNCH_HOLE | FALLOC_FL_KEEP_SIZE, block.offset, size);
    free_places_.push_back(block.offset);
}

void Block_Memory::come_in(Block& block)
{
    const Auto_Lock lock(mutex_);
    if (!block.is_here.exchange(true))
        note_here(block);
}

void Block_Memory::note_here(Block& block)
{
    here_.push_back(&block);
    if (here_.size() <= most_blocks_)
        return;
    Block& oldest = *here_.front();
    here_.erase(here_.begin());
    oldest.is_here = false;
    // The pages go, what stands in them stays in the file.
    madvise(oldest.begin, size, MADV_DONTNEED);
}

std::size_t Block_Memory::in_file() const
{
    const Auto_Lock lock(mutex_);
    return static_cast<std::size_t>(file_end_) - free_places_.size() * size;
}

} // namespace KPRV::broker
