#pragma once

#include <json/json.h>
#include <string>
#include <utility>
#include <vector>

namespace KPRV::simulator {

/// A virtual FC port: a second identity of a port in the fabric.
struct Virtual_Port
{
    std::string address;
    Json::Value data; // the answer of getVPort
};

/// A further Ethernet function of a port. Bandwidths are in megabits a second.
struct Virtual_Nic
{
    unsigned function; // its PCI function on the adapter
    std::string mac;
    unsigned min_bandwidth;
    unsigned max_bandwidth;
};

/// Records that belong to a port or to something behind it, in the order of their making; the path of
/// a Target tells to what. There is one record for a path.
class Path_Records
{
public:
    bool contains(const std::string& path) const;

    /// In place of the one that the path has, or as the last.
    void put(const std::string& path, Json::Value record);

    void remove(const std::string& path);

    /// Also removes those of all that lies behind the path.
    void remove_below(const std::string& path);

    void clear() { _records.clear(); }

    /// An array of the records.
    Json::Value list() const;

private:
    std::vector<std::pair<std::string, Json::Value>> _records;
};

} // namespace KPRV::simulator
