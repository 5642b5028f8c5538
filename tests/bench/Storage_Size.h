#pragma once

#include <compare>
#include <functional>
#include <vector>

namespace KPRV::bench {

/// The size of a host in benchmarks. Each port sees targets of its own.
struct Storage_Size
{
    unsigned adapters = 1;
    unsigned ports = 1;   ///< Of each adapter.
    unsigned targets = 0; ///< Of each port.
    unsigned luns = 0;    ///< Of each target.

    auto operator<=>(const Storage_Size&) const = default;
    unsigned all_ports() const { return adapters * ports; }
    unsigned all_paths() const { return all_ports() * targets * luns; }
};

/// What the prepared adapter library exports beside its entry points: the answers of the calls to come are
/// those of a host of that size.
using Prepare_Storage = void (*)(const Storage_Size& size);

/// Calls about adapters, ports and what lies behind them, each with its request: to be made again.
using Recorded_Calls = std::vector<std::function<void()>>;
/// Where calls are noted from now on; null: nowhere.
using Record_Calls = void (*)(Recorded_Calls* calls);

} // namespace KPRV::bench
