#pragma once

#include "module/runtime/system/Standard_Mutex.h"

#include <atomic>
#include <cstddef>
#include <sys/types.h>
#include <vector>

namespace KPRV::broker {

/// Memory in blocks of one size. Blocks beyond a bound lie in a file without a name, in the folder that
/// TMPDIR names or in /var/tmp: only those used last take memory of the process, the others are the system's
/// to write out. Where no such file can be made, all lie in memory. Safe for any thread.
///
/// How it works. A block of the file is mapped like one of memory, so that its addresses stay good whether
/// its pages are here or not: who reads an address that is not here waits for the disk, and notices nothing.
/// Its place in the file is reserved first; a full disk is therefore seen before a page is lost to it. Blocks
/// come in by `touch` and leave in the order in which they came.
class Block_Memory
{
public:
    static constexpr std::size_t BLOCK_SIZE = std::size_t(1) << 18;

    struct Block
    {
        char* begin = nullptr;
        /// Where it lies in the file; negative for one of memory.
        off_t offset = -1;
        /// Its pages may be here.
        std::atomic<bool> is_here = true;
    };

    /// So many bytes lie in memory before there is a file, and so many of the file at a time; 0 for no bound.
    explicit Block_Memory(std::size_t most_in_memory) : _most_blocks(most_in_memory / BLOCK_SIZE)
    {
        _here.reserve(_most_blocks + 1);
    }
    ~Block_Memory();
    Block_Memory(const Block_Memory&) = delete;
    Block_Memory& operator=(const Block_Memory&) = delete;

    /// Fills the block's members; its memory begins at a multiple of its size. Throws `std::bad_alloc`.
    void take(Block& block);
    void give(Block& block);

    /// To be called before a block is used; the first use after a long time makes another one leave.
    void touch(Block& block)
    {
        if (!block.is_here.load(std::memory_order_relaxed))
            come_in(block);
    }

    /// Bytes of the file that are in use.
    std::size_t in_file() const;

private:
    void come_in(Block& block);
    void note_here(Block& block) REQUIRES(_mutex);
    /// A reserved place in the file; negative if there is none.
    off_t place_in_file() REQUIRES(_mutex);

    const std::size_t _most_blocks;
    mutable Standard_Mutex<> _mutex;
    std::size_t _in_memory GUARDED_BY(_mutex) = 0;
    int _file GUARDED_BY(_mutex) = -1;
    bool _has_no_file GUARDED_BY(_mutex) = false;
    off_t _file_end GUARDED_BY(_mutex) = 0;
    std::vector<off_t> _free_places GUARDED_BY(_mutex);
    /// Blocks of the file that are here, the oldest first.
    std::vector<Block*> _here GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
