#pragma once

#include "simulator/Counters.h"
#include "simulator/Event_Feed.h"
#include "simulator/Json_Text.h"
#include "simulator/Port_Additions.h"
#include "simulator/Posted_Tests.h"
#include "simulator/Remote_Port_List.h"
#include "simulator/Reset_Marks.h"

#include <cstddef>
#include <json/json.h>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

namespace KPRV::simulator {

/// What is plugged into a port, as the library's answers tell it.
struct Optics
{
    Json::Value identity; // the answer of getOpticsSFP
    Json::Value readings; // the answer of getOpticsPOM; null for optics that are not monitored
};

enum class Port_Kind
{
    FC,
    ETHERNET,
};

/// A port, as the library's answers tell it.
struct Port
{
    Port_Kind kind = Port_Kind::FC;
    std::string address;  // WWN of an FC port, MAC of an Ethernet port
    Json::Value data;     // the answer of getPortByWwn
    Json::Value eth_data; // `ethData` of getEthPortByEthMac; null for an FC port
    std::optional<Optics> optics;
    Counters counters;             // of an FC port
    Remote_Port_List remote_ports; // of an FC port
    Json::Value answers;           // answers of the author's own, by entry point
    Json::Value settings;          // what was written or set of each, by its name in Settings.h
    Json::Value tests;             // outcomes of hardware tests, by entry point
    std::vector<Virtual_Port> virtual_ports;
    std::vector<Virtual_Nic> vnics;
    Path_Records lun_masks;
    Path_Records io_profiles;
    std::optional<std::string> dport; // the request id under which it was enabled as a D-Port
};

/// An adapter, as the library's answers tell it.
struct Adapter
{
    std::string address; // what getAllAdaptersIndexString lists
    Json::Value data;    // the answer of getHbaByWwn: `hbaData`, `driver`, `firmware`
    Json::Value flash_status;
    Json::Value tests;        // outcomes of hardware tests, by entry point
    Json::Value flash_update; // `status` and `message` of an update whose image is good
    std::vector<Port> fc_ports;
    std::vector<Port> eth_ports;
    Json::Value answers;
    Json::Value settings; // as of a port
};

/// A host with its adapters: what an inventory file describes, and what "set" calls change.
class Inventory
{
public:
    /// A host without adapters.
    Inventory();

    /// Reads an inventory; simulator/INVENTORY.md tells its shape. Throws Refused.
    explicit Inventory(const Json_Text& source);

    /// Where an address leads. `port` is null for an adapter's own address; both are null for an
    /// address that the inventory does not have.
    struct Place
    {
        Adapter* adapter = nullptr;
        Port* port = nullptr;
        explicit operator bool() const { return adapter != nullptr; }
    };

    /// The adapter that has this WWN, MAC or listed address, in colon form and in any letter case.
    Place adapter_at(const std::string& address);

    /// The port that has this address. An Ethernet port comes before an FCoE port of the same MAC.
    Place port_at(const std::string& address);

    /// The number from 1 by which the library knows the adapter.
    unsigned adapter_id(const Adapter& adapter) const;

    Json::Value host;    // `hostManufacturer`, `hostModel`
    Json::Value version; // text, or null
    Json::Value init;    // the answer of init_hba_lib
    Json::Value faults;  // as written, for Fault to read
    std::vector<Scripted_Event> events;
    Json::Value answers; // answers of the author's own that belong to no adapter
    std::vector<Adapter> adapters;
    Reset_Marks reset_marks;
    Posted_Tests posted_tests;
    Json::Value posted_tests_members; // `milliseconds`, `failing`

private:
    // Positions, not pointers: an inventory can be copied and moved.
    struct Position
    {
        std::size_t adapter;
        std::size_t port;
        bool ethernet;
    };
    using Index = std::unordered_map<std::string, Position>;

    void index_adapter(const Json_Text& source, const Json::Value& written, std::size_t number);

    Index _adapter_index;
    Index _port_index;
};
} // namespace KPRV::simulator
