#include "kldrcim/server/Connection_Watch.h"

#include <sys/socket.h>

namespace KPRV::kldrcim {

Connection_Watch::Connection_Watch() : thread_([this] { run(); }) {}

Connection_Watch::~Connection_Watch()
{
    {
        const Auto_Lock lock(mutex_);
        stop_ = true;
    }
    changed_.notify_all();
    thread_.join();
}

void Connection_Watch::limit(int socket, std::chrono::seconds time)
{
    const Auto_Lock lock(mutex_);
    ends_[socket] = Clock::now() + time;
}

void Connection_Watch::release(int socket)
{
    const Auto_Lock lock(mutex_);
    ends_.erase(socket);
}

void Connection_Watch::run()
{
    const Auto_Lock lock(mutex_);
    while (!stop_) {
        changed_.wait_for(mutex_, std::chrono::milliseconds(500));
        const auto now = Clock::now();
        // Shut down, not closed: the connection's own thread sees its end and gives the socket back.
        std::erase_if(ends_, [&](const auto& entry) {
            if (entry.second > now)
                return false;
            shutdown(entry.first, SHUT_RDWR);
            return true;
        });
    }
}

} // namespace KPRV::kldrcim
