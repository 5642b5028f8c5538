#pragma once

#include <chrono>

namespace KPRV::kldrcim {

/// SIGINT, SIGTERM and SIGHUP for a scope: they are taken note of, and end nothing by themselves. One scope
/// at a time.
class Interruption
{
public:
    Interruption();
    ~Interruption();
    Interruption(const Interruption&) = delete;
    Interruption& operator=(const Interruption&) = delete;

    /// How many have come, and the number of the latest; 0 for none.
    unsigned count() const;
    int latest() const;

    /// Until a signal comes, or `wake` is called, once for each of them.
    void wait();
    /// The same for no longer than that.
    void wait(std::chrono::milliseconds time);
    /// From any thread.
    void wake();
};

/// The exit status by which shells know a program that a signal has ended.
inline int status_of_signal(int number)
{
    return 128 + number;
}

/// Keeps SIGINT, SIGTERM and SIGHUP from the calling thread, and from the threads that it starts, for a
/// scope. What comes meanwhile has its effect at the end.
class Signals_Held_Back
{
public:
    Signals_Held_Back();
    ~Signals_Held_Back();
    Signals_Held_Back(const Signals_Held_Back&) = delete;
    Signals_Held_Back& operator=(const Signals_Held_Back&) = delete;
};

} // namespace KPRV::kldrcim
