#pragma once

#include <exception>

namespace KPRV {

/// To be called first in a `catch (...)` that goes on: what is no exception of C++ is the unwinding of a
/// thread that is being cancelled or that ends itself, and the C library aborts the process if anything stops
/// it. `std::current_exception()` tells the two apart, also in a detached thread, where
/// `abi::__cxa_current_exception_type()` reads what is none of its own.
inline void rethrow_forced_unwinding()
{
    if (!std::current_exception())
        throw;
}

} // namespace KPRV
