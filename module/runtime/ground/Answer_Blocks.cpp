#include "module/runtime/ground/Answer_Blocks.h"

#include <algorithm>
#include <atomic>
#include <cstring>
#include <limits>
#include <new>

#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/asan_interface.h>
#else
#define ASAN_POISON_MEMORY_REGION(address, size) ((void)(address), (void)(size))
#define ASAN_UNPOISON_MEMORY_REGION(address, size) ((void)(address), (void)(size))
#endif

namespace KPRV {

namespace {

constexpr size_t WORD = sizeof(void*);
constexpr size_t FIRST_PIECE = 4096, LAST_PIECE = 32768;
/// Larger blocks are allocations of their own, so that little of a piece is left over.
constexpr size_t LARGEST_CUT = 2048;

constinit thread_local Answer_Blocks* current = nullptr;

/// A first piece that an answer has done with, for the next one: most answers need no more.
constinit std::atomic<void*> spare = nullptr;

/// After whatever gives blocks back when the library goes.
[[gnu::destructor(101)]] void free_spare()
{
    ::operator delete(spare.exchange(nullptr));
}

} // namespace

struct Answer_Blocks::Piece
{
    std::atomic<int>
        out; ///< Blocks that have not come back; less all those that were cut, while it is cut from.
    size_t size;

    char* begin() { return reinterpret_cast<char*>(this + 1); }

    static Piece* make(size_t size)
    {
        void* room = size == FIRST_PIECE ? spare.exchange(nullptr, std::memory_order_acquire) : nullptr;
        return new (room ? room : ::operator new(size)) Piece{0, size};
    }

    /// That many more are out, or fewer; with the last one it goes.
    void count(int blocks)
    {
        if (out.fetch_add(blocks, std::memory_order_acq_rel) + blocks != 0)
            return;
        ASAN_UNPOISON_MEMORY_REGION(begin(), size - sizeof *this);
        void* const former = size == FIRST_PIECE ? spare.exchange(this, std::memory_order_acq_rel) : this;
        ::operator delete(former);
    }

    // What stands in front of a block, where nobody else may look.

    [[gnu::no_sanitize_address]] static Piece* of(void* block) { return static_cast<Piece**>(block)[-1]; }
    [[gnu::no_sanitize_address]] static void mark(void* block, Piece* piece)
    {
        static_cast<Piece**>(block)[-1] = piece;
    }
};

Answer_Blocks::Answer_Blocks() : _outermost(!current)
{
    if (_outermost)
        current = this;
}

Answer_Blocks::~Answer_Blocks()
{
    if (!_outermost)
        return;
    current = nullptr;
    end_piece();
}

void Answer_Blocks::begin_piece()
{
    const size_t size = std::min(LAST_PIECE, std::max(FIRST_PIECE, 2 * _piece_size));
    Piece* const piece = Piece::make(size);
    end_piece();
    _piece = piece;
    _piece_size = size;
    _next = piece->begin();
    _left = size - sizeof *piece;
    ASAN_POISON_MEMORY_REGION(_next, _left);
}

void Answer_Blocks::end_piece()
{
    if (_piece)
        _piece->count(_cut);
    _cut = 0;
}

void* Answer_Blocks::cut(size_t size)
{
    const size_t taken = WORD + (size + WORD - 1) / WORD * WORD;
    // Either way (boundary): the last place of a piece would stay free.
    if (taken > _left) [[unlikely]]
        begin_piece();
    void* const block = _next + WORD;
    _next += taken;
    _left -= taken;
    _cut++;
    ASAN_UNPOISON_MEMORY_REGION(block, size);
    Piece::mark(block, _piece);
    return block;
}

/// An allocation with a word more than is asked for, behind that word.
static void* separate_block(size_t size)
{
    if (size > std::numeric_limits<size_t>::max() - WORD)
        throw std::bad_alloc();
    return static_cast<char*>(::operator new(WORD + size)) + WORD;
}

void* take_block(size_t size)
{
    if (current && size <= LARGEST_CUT)
        return current->cut(size);
    void* const block = separate_block(size);
    Answer_Blocks::Piece::mark(block, nullptr);
    return block;
}

void give_block(void* block) noexcept
{
    Answer_Blocks::Piece* const piece = Answer_Blocks::Piece::of(block);
    if (!piece) {
        ::operator delete(static_cast<char*>(block) - WORD);
        return;
    }
    ASAN_POISON_MEMORY_REGION(block, WORD);
    piece->count(-1);
}

void* resize_block(void* block, size_t former_size, size_t size)
{
    void* const other = take_block(size);
    memcpy(other, block, std::min(former_size, size));
    give_block(block);
    return other;
}

} // namespace KPRV
