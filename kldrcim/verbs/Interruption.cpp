#include "kldrcim/verbs/Interruption.h"

#include <atomic>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <iterator>
#include <semaphore.h>

namespace KPRV::kldrcim {

namespace {

constexpr int signals[] = {SIGINT, SIGTERM, SIGHUP};

// A signal handler may touch these, and nothing else of the program.
std::atomic<unsigned> signals_come;
std::atomic<int> latest_signal;
sem_t work;
struct sigaction before[std::size(signals)];

extern "C" void take_note(int number)
{
    const int error = errno;
    latest_signal = number;
    ++signals_come;
    sem_post(&work);
    errno = error;
}

sigset_t set_of_signals()
{
    sigset_t set;
    sigemptyset(&set);
    for (const int number : signals)
        sigaddset(&set, number);
    return set;
}

} // namespace

Interruption::Interruption()
{
    signals_come = 0;
    latest_signal = 0;
    sem_init(&work, 0, 0);
    struct sigaction action = {};
    action.sa_handler = take_note;
    action.sa_flags = SA_RESTART;
    for (std::size_t i = 0; i < std::size(signals); ++i) {
        sigaction(signals[i], nullptr, &before[i]);
        // A shell that starts a program in the background, or nohup, has asked it to ignore them.
        if (before[i].sa_handler != SIG_IGN)
            sigaction(signals[i], &action, nullptr);
    }
}

Interruption::~Interruption()
{
    for (std::size_t i = 0; i < std::size(signals); ++i)
        sigaction(signals[i], &before[i], nullptr);
}

unsigned Interruption::count() const
{
    return signals_come;
}

int Interruption::latest() const
{
    return latest_signal;
}

void Interruption::wait()
{
    while (sem_wait(&work) != 0 && errno == EINTR)
        continue;
}

void Interruption::wait(std::chrono::milliseconds time)
{
    timespec end;
    clock_gettime(CLOCK_MONOTONIC, &end);
    const auto nanoseconds = std::chrono::nanoseconds(time).count() + end.tv_nsec;
    end.tv_sec += static_cast<time_t>(nanoseconds / 1000000000);
    end.tv_nsec = static_cast<long>(nanoseconds % 1000000000);
    while (sem_clockwait(&work, CLOCK_MONOTONIC, &end) != 0 && errno == EINTR)
        continue;
}

void Interruption::wake()
{
    sem_post(&work);
}

Signals_Held_Back::Signals_Held_Back()
{
    const sigset_t set = set_of_signals();
    pthread_sigmask(SIG_BLOCK, &set, nullptr);
}

Signals_Held_Back::~Signals_Held_Back()
{
    const sigset_t set = set_of_signals();
    pthread_sigmask(SIG_UNBLOCK, &set, nullptr);
}

} // namespace KPRV::kldrcim
