#pragma once

#include <chrono>
#include <thread>

namespace KPRV {

/// How long a test waits for what must come. No machine is so busy that it takes this long.
inline constexpr std::chrono::seconds PATIENCE{120};

/// True as soon as the condition holds; false if it does not while anybody could be expected to wait.
template <class Condition>
bool eventually(Condition condition)
{
    const auto end = std::chrono::steady_clock::now() + PATIENCE;
    while (!condition()) {
        if (std::chrono::steady_clock::now() > end)
            return false;
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    return true;
}

} // namespace KPRV
