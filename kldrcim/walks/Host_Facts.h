#pragma once

#include "kldrcim/walks/Association_Index.h"
#include "kldrcim/walks/Optics.h"

namespace KPRV::kldrcim {

/// A target as one port sees it.
struct Target_Facts
{
    /// The endpoint at the far side.
    Instance_Value endpoint;
    /// Of the target port, as the module writes it: hexadecimal digits alone.
    std::string address;
    /// Logical units behind it, of all kinds. 0 unless they were asked for.
    std::size_t units = 0;
};

struct Port_Facts
{
    Instance_Value port;
    bool is_ethernet = false;
    /// Of an FC port that counts; otherwise without properties.
    Instance_Value statistics = {};
    std::vector<Target_Facts> targets = {};
    /// Nothing unless it was asked for.
    Optics_Readings optics = {};
};

struct Adapter_Facts
{
    Instance_Value controller;
    /// The card that realizes it; without properties if there is none.
    Instance_Value card = {};
    std::vector<Instance_Value> software = {};
    /// FC ports, then Ethernet ports.
    std::vector<Port_Facts> ports = {};

    /// What the card says it is; empty if nothing does.
    std::string model() const;
    /// Version of its firmware; empty if the module does not publish it.
    std::string firmware() const;
};

/// The host with all that hangs on it down to its targets, each port once. Logical units are counted, not
/// held, since a host may have millions.
struct Host_Facts
{
    /// Without properties if nobody answered for it.
    Instance_Value system;
    std::vector<Adapter_Facts> adapters;
};

struct Host_Facts_Options
{
    bool statistics = true;
    bool units = false;
};

/// Walks. What cannot be asked is left out and told by `index.failures()`.
Host_Facts read_host_facts(Association_Index& index, const Host_Facts_Options& options);

/// Codes of the CIM Schema: which software is what.
inline constexpr std::uint64_t CLASSIFICATION_DRIVER = 2;
inline constexpr std::uint64_t CLASSIFICATION_FIRMWARE = 10;

} // namespace KPRV::kldrcim
