#pragma once

#include <cstddef>
#include <json/json.h>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

namespace KPRV::simulator {

/// A port across the fabric, as the library's answers tell it. Nothing changes it once it is read,
/// so all local ports that see it share the one record.
struct Remote_Port
{
    std::string address;
    Json::Value listed;   // its element of getAllRemotePorts
    Json::Value complete; // the answer of getCompleteRemotePort
};

/// Remote ports in the order in which the library lists them, each found by its address.
class Remote_Port_List
{
public:
    using Shared = std::shared_ptr<const Remote_Port>;

    /// False, and nothing is added, if there is one of the same address.
    bool add(Shared port);

    /// The one that has this address, in any letter case, or a null pointer.
    Shared find(const std::string& address) const;

    /// The answer of getAllRemotePorts.
    Json::Value list() const;

private:
    std::vector<Shared> _ports;
    std::unordered_map<std::string, std::size_t> _index;
};

} // namespace KPRV::simulator
