#pragma once

#include <cstddef>
#include <new>
#include <string>

namespace KPRV {

/// Blocks that `operator new` has given out and that are not back yet, in the whole program: instances, their
/// texts, and what else there is.
size_t live_blocks();

/// The n-th block that the calling thread asks for from now on, counted from 1, is refused, and no other.
void refuse_block(size_t nth);
/// No block is refused any more. How many the thread has asked for since.
size_t grant_blocks();

/// Calls the function as often as it asks for blocks, each time without another one of them, and then
/// `forget` for what the test itself keeps. The numbers of those without which something is not given back;
/// empty if whatever is being made has an owner at each moment.
template <class Function, class Forget>
std::string lost_without_a_block(Function function, Forget forget)
{
    function();
    refuse_block(0);
    function();
    const size_t count = grant_blocks();
    std::string numbers;
    for (size_t nth = 1; nth <= count; nth++) {
        forget();
        const size_t before = live_blocks();
        refuse_block(nth);
        try {
            function();
        } catch (const std::bad_alloc&) {
            // As a provider lets it pass.
        }
        grant_blocks();
        forget();
        if (before != live_blocks())
            numbers += std::to_string(nth) + " ";
    }
    return numbers;
}

} // namespace KPRV
