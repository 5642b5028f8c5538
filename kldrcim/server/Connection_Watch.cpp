#include "kldrcim/server/Connection_Watch.h"

#include <sys/socket.h>

namespace KPRV::kldrcim {

Connection_Watch::Connection_Watch() : _thread([this] { run(); }) {}

Connection_Watch::~Connection_Watch()
{
    {
        const Auto_Lock lock(_mutex);
        _stop = true;
    }
    _changed.notify_all();
    _thread.join();
}

void Connection_Watch::limit(int socket, std::chrono::seconds time)
{
    const Auto_Lock lock(_mutex);
    _ends[socket] = Clock::now() + time;
}

void Connection_Watch::release(int socket)
{
    const Auto_Lock lock(_mutex);
    _ends.erase(socket);
}

void Connection_Watch::run()
{
    const Auto_Lock lock(_mutex);
    while (!_stop) {
        _changed.wait_for(_mutex, std::chrono::milliseconds(500));
        const auto now = Clock::now();
        // Shut down, not closed: the connection's own thread sees its end and gives the socket back.
        std::erase_if(_ends, [&](const auto& entry) {
            if (entry.second > now)
                return false;
            shutdown(entry.first, SHUT_RDWR);
            return true;
        });
    }
}

} // namespace KPRV::kldrcim
