#include "simulator/Statistics_Kinds.h"

#include <iterator>
#include <numeric>
#include <sstream>

namespace KPRV::simulator {

namespace {

// In the order of the enumeration.
// clang-format off
constexpr Statistics_Kind kinds[] = {
    // group          whose counters            what they stand at in a host that has run for a day
    {"firmware",      Scope::ADAPTER_OR_PORT,   "commands=18204 responses=18204 asyncEvents=112 heartbeats=86400 resets=0"},
    {"trunking",      Scope::ADAPTER_OR_PORT,   "txFrames=2481377 rxFrames=1723004 linkFailures=0 resyncs=0"},
    {"fcoe",          Scope::FCOE_PORT,         "txFrames=90412 rxFrames=88120 fipSolicitations=6 fipAdvertisements=1440 fipVlanRequests=4 clearVirtualLinks=0 fcfTimeouts=0"},
    {"fcpimMod",      Scope::FC_PORT,           "itnims=4 onlineEvents=6 offlineEvents=2 prliSent=6 prliRejected=0 ioTimeouts=0"},
    {"vhba",          Scope::FC_PORT,           "readRequests=640128 writeRequests=320064 readKBytes=20484096 writeKBytes=10242048 aborts=0"},
    {"fabric",        Scope::FC_PORT,           "flogiSent=2 flogiAccepted=2 flogiRejected=0 fabricOffline=1 npivLogins=0"},
    {"ioc",           Scope::FC_PORT,           "mailboxInterrupts=9102 queueInterrupts=1841220 hardwareErrors=0 heartbeatFailures=0"},
    {"portAuth",      Scope::FC_PORT,           "negotiations=6 challenges=3 accepted=3 rejected=0"},
    {"qos",           Scope::FC_PORT,           "highFrames=40960 mediumFrames=1640448 lowFrames=41596 flogiAccepted=2 rscns=14"},
    {"ethernetPort",  Scope::ETH_PORT,          "txFrames=771004 txBytes=602417152 rxFrames=803312 rxBytes=714080256 rxDropped=0 rxFcsErrors=0 txPause=8 rxPause=3"},
    {"ethernetIoc",   Scope::ETH_PORT,          "txInterrupts=81004 rxInterrupts=90417 txQueueFull=0 rxNoBuffer=0 linkDowns=1"},
    {"lldp",          Scope::ETH_PORT,          "framesOut=2880 framesIn=2880 framesDiscarded=0 errors=0 neighborsAgedOut=0"},
    {"vnic",          Scope::VNIC,              "txFrames=192751 txBytes=150604288 rxFrames=200828 rxBytes=178520064 rxDropped=0"},
    {"logicalPort",   Scope::FC_PORT,           "plogiSent=8 plogiAccepted=8 plogiRejected=0 nsQueries=24 rscns=14 ioRequests=960192"},
    {"virtualPort",   Scope::VIRTUAL_PORT,      "fdiscSent=2 fdiscAccepted=2 fdiscRejected=0 nsQueries=6 rscns=4 ioRequests=96019"},
    {"remotePort",    Scope::FC_PORT,           "plogiSent=2 plogiReceived=0 logouts=1 adiscSent=4 rscns=3 offline=1"},
    {"fcpim",         Scope::FC_PORT,           "ioRequests=240048 ioCompletions=240048 ioTimeouts=0 taskManagement=2 aborts=0"},
    {"fcpim",         Scope::FC_PORT,           "readRequests=160032 readKBytes=5121024 writeRequests=80016 writeKBytes=2560512 controlRequests=24"},
    {"advancedIo",    Scope::FC_PORT,           "reads=40008 writes=20004 minLatencyMicroseconds=84 averageLatencyMicroseconds=312 maxLatencyMicroseconds=9120 outstanding=0"},
};
// clang-format on

static_assert(std::size(kinds) == static_cast<std::size_t>(Statistics::ADVANCED_IO) + 1);

// Two things of a kind should not show the same figures, and one always the same.
unsigned long long figure_at(const std::string& path, unsigned long long figure)
{
    const unsigned spread = std::accumulate(path.begin(), path.end(), 0U) % 16;
    return figure + figure / 16 * spread;
}

} // namespace

const Statistics_Kind& statistics_kind(Statistics kind)
{
    return kinds[static_cast<std::size_t>(kind)];
}

Json::Value counters_at(const Inventory& inventory, Statistics kind, const std::string& path)
{
    const Statistics_Kind& row = statistics_kind(kind);
    const bool zero = inventory.reset_marks.is_reset(row.group, path);
    Json::Value answer(Json::objectValue);
    std::istringstream counters(row.counters);
    for (std::string counter; counters >> counter;) {
        const std::size_t equals = counter.find('=');
        const unsigned long long figure = std::stoull(counter.substr(equals + 1));
        answer[counter.substr(0, equals)] = std::to_string(zero ? 0 : figure_at(path, figure));
    }
    return answer;
}

} // namespace KPRV::simulator
