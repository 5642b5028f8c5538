#pragma once

#include <cstddef>

namespace KPRV {

// The memory of instances, texts and arrays: each is one block, aligned to a word, taken and given back here.
// Without memory the first and the last throw `std::bad_alloc`.

void* take_block(size_t size);
/// Whatever thread took it, in an `Answer_Blocks` or not.
void give_block(void* block) noexcept;
/// Its contents, as far as both sizes go, in a block of another size; the block stays where there is no
/// memory.
void* resize_block(void* block, size_t former_size, size_t size);

/// While it stands, the calling thread's blocks are cut one behind the other from larger pieces, which costs
/// a few instructions each: for what is made in great numbers and given back soon, as an answer is. What is
/// to be kept for long is better made without it, since a piece goes with the last of its blocks.
///
/// How it works. In front of each block stands a word: the piece that it was cut from, or null if it is an
/// allocation of its own. Giving a block back counts it at its piece, and nothing is used twice. A piece goes
/// when all that was cut from it has come back and nothing more will be cut: `_cut` is added to the count
/// only then, so that before it never comes to 0. Pieces grow from one to the next, so that a small answer
/// takes little. Within another one, on the same thread, it is part of that.
class Answer_Blocks
{
public:
    Answer_Blocks();
    ~Answer_Blocks();
    Answer_Blocks(const Answer_Blocks&) = delete;
    Answer_Blocks& operator=(const Answer_Blocks&) = delete;

private:
    friend void* take_block(size_t size);
    friend void give_block(void* block) noexcept;
    struct Piece;

    void* cut(size_t size);
    void begin_piece();
    void end_piece();

    const bool _outermost;
    Piece* _piece = nullptr;
    char* _next = nullptr;
    size_t _left = 0;
    int _cut = 0; ///< Blocks of the piece.
    size_t _piece_size = 0;
};

} // namespace KPRV
