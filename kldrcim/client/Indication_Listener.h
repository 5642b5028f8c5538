#pragma once

#include "kldrcim/connection/Connection.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <cstdint>

struct MHD_Daemon;

namespace KPRV::kldrcim {

/// A small HTTP server that takes the indications of a CIM server. Each name space has a path of its own,
/// which nobody guesses: whoever knows none is refused.
class Indication_Listener
{
public:
    /// Null with `error` if it cannot listen at the address, which is one of this machine.
    static std::unique_ptr<Indication_Listener> start(const std::string& address, Indication_Sink sink,
                                                      std::string& error);
    /// Waits for what is being taken.
    ~Indication_Listener();

    /// Where indications of the name space are to be sent.
    std::string add(const std::string& name_space);

private:
    struct Callbacks;

    Indication_Listener(std::string address, Indication_Sink sink);
    /// Nothing for a path that leads nowhere.
    std::optional<std::string> name_space_of(const std::string& path) const;
    /// The status of HTTP for a body that came to that path.
    unsigned take(const std::string& path, const std::string& body) const;

    const std::string _address;
    const Indication_Sink _sink;
    const std::string _secret;
    mutable Standard_Mutex<> _mutex;
    std::vector<std::string> _name_spaces GUARDED_BY(_mutex);
    std::uint16_t _port = 0;
    MHD_Daemon* _daemon = nullptr;
};

} // namespace KPRV::kldrcim
