#include "tests/bench/Plain_Provider.h"
#include "tests/bench/plain_lun.h"

#include <cctype>
#include <string>
#include <strings.h>
#include <unordered_map>
#include <vector>

namespace KPRV::bench {

namespace {

/// What is joined, by names that begin with the name of what stands before it on the path: a target's with
/// its initiator's, a unit's with its target's.
struct named
{
    std::string name;
    /// Of the name before it; an initiator's is all its own.
    size_t head_size;

    std::string_view head() const { return std::string_view(name).substr(0, head_size); }
};

struct storage
{
    char host[256];
    std::vector<named> initiators, targets, units;
};

/// `visit(target, names)` for each unit of the tape drives or of all others.
template <class Visit>
void for_each_unit(bool tapes, Visit visit)
{
    plain_for_each_port([&](int, const Json::Value& port) {
        plain_for_each_target(port["wwn"], [&](const plain_target& target) {
            if (target.is_tape() == tapes)
                plain_for_each_lun(
                    target, [&](const Json::Value&, const plain_lun_names& names) { visit(target, names); });
        });
    });
}

/// `on_initiator(name)` for each port, and `on_target(target)` for each target that it sees.
template <class On_Initiator, class On_Target>
void for_each_endpoint(On_Initiator on_initiator, On_Target on_target)
{
    plain_for_each_port([&](int, const Json::Value& port) {
        char name[24];
        plain_flat(name, sizeof name, port["wwn"].asCString());
        on_initiator(name);
        plain_for_each_target(port["wwn"], on_target);
    });
}

void read_storage(storage& all)
{
    plain_host_name(all.host, sizeof all.host);
    for (const bool tapes : {false, true})
        for_each_unit(tapes, [&](const plain_target& target, const plain_lun_names& names) {
            all.units.push_back({names.id(), target.size});
        });
    for_each_endpoint(
        [&](const char* name) {
            all.initiators.push_back({name, strlen(name)});
        },
        [&](const plain_target& target) {
            all.targets.push_back({target.name, target.port_size});
        });
}

CMPIObjectPath* endpoint_path(const CMPIBroker* broker, const char* host, const char* name)
{
    return plain_device_path(broker, "KALDERA_SCSIProtocolEndpoint", host, "Name", name);
}

/// What a join delivers, one of the two below.
struct delivery
{
    const CMPIBroker* broker;
    const CMPIResult* result;
    const char* host;

    CMPIObjectPath* end(const named& endpoint) const
    {
        return endpoint_path(broker, host, endpoint.name.c_str());
    }
};

/// The paths, whole.
struct whole_paths : delivery
{
    const char* name_space;

    void deliver(CMPIObjectPath* initiator, CMPIObjectPath* target, const named& unit) const
    {
        const plain_end ends[] = {
            {"Initiator", initiator},
            {"Target", target},
            {"LogicalUnit",
             plain_device_path(broker, "KALDERA_StorageExtent", host, "DeviceID", unit.name.c_str())},
        };
        CMReturnInstance(result, plain_association(broker, name_space,
                                                   "KALDERA_SCSIInitiatorTargetLogicalUnitPath", ends));
    }
};

/// The names of the outer ends of one unit's paths.
struct ends_of_unit : delivery
{
    const char* wanted;

    void deliver(CMPIObjectPath* initiator, CMPIObjectPath* target, const named& unit) const
    {
        if (unit.name != wanted)
            return;
        CMReturnObjectPath(result, initiator);
        CMReturnObjectPath(result, target);
    }
};

bool stands_behind(const named& one, const named& other)
{
    return one.head_size == other.name.size() &&
           strncasecmp(one.name.c_str(), other.name.c_str(), one.head_size) == 0;
}

/// The three loops. Sizes are compared before texts.
template <class Delivery>
void join_by_loops(const storage& all, const Delivery& to, bool outer_ends_once)
{
    for (const named& initiator : all.initiators) {
        CMPIObjectPath* from = to.end(initiator);
        for (const named& target : all.targets) {
            if (!stands_behind(target, initiator))
                continue;
            CMPIObjectPath* through = to.end(target);
            for (const named& unit : all.units) {
                if (!stands_behind(unit, target))
                    continue;
                if (!outer_ends_once) {
                    from = to.end(initiator);
                    through = to.end(target);
                }
                to.deliver(from, through, unit);
            }
        }
    }
}

/// What stands behind a name, whatever the name's case.
class name_index
{
public:
    explicit name_index(const std::vector<named>& list)
    {
        std::string_view last;
        std::vector<const named*>* behind_last = nullptr;
        for (const named& each : list) {
            // Those behind one name stand together.
            if (!behind_last || each.head() != last) {
                last = each.head();
                behind_last = &_behind[folded(last)];
            }
            behind_last->push_back(&each);
        }
    }

    const std::vector<const named*>& behind(const named& one) const
    {
        static const std::vector<const named*> none;
        const auto found = _behind.find(folded(one.name));
        return found == _behind.end() ? none : found->second;
    }

private:
    static std::string folded(std::string_view name)
    {
        std::string key(name);
        for (char& letter : key)
            letter = static_cast<char>(tolower(static_cast<unsigned char>(letter)));
        return key;
    }

    std::unordered_map<std::string, std::vector<const named*>> _behind;
};

void join_by_index(const storage& all, const whole_paths& to)
{
    const name_index targets(all.targets), units(all.units);
    for (const named& initiator : all.initiators) {
        CMPIObjectPath* const from = to.end(initiator);
        for (const named* target : targets.behind(initiator)) {
            CMPIObjectPath* const through = to.end(*target);
            for (const named* unit : units.behind(*target))
                to.deliver(from, through, *unit);
        }
    }
}

/// A unit is joined to the one target in whose name its own begins: nothing else needs to be kept.
void look_up_ends(const CMPIBroker* broker, const CMPIResult* result, const char* wanted)
{
    char host[256];
    plain_host_name(host, sizeof host);
    std::string target_name, initiator_name;
    for (const bool tapes : {false, true})
        for_each_unit(tapes, [&](const plain_target& target, const plain_lun_names& names) {
            if (strcmp(names.id(), wanted) == 0)
                target_name = target.name;
        });
    for_each_endpoint([&](const char* name) { initiator_name = name; },
                      [&](const plain_target& target) {
                          if (strcasecmp(target.name, target_name.c_str()) != 0)
                              return;
                          CMReturnObjectPath(result, endpoint_path(broker, host, initiator_name.c_str()));
                          CMReturnObjectPath(result, endpoint_path(broker, host, target.name));
                      });
}

} // namespace

CMPIStatus plain_enumerate_paths(const CMPIBroker* broker, const CMPIResult* result,
                                 const CMPIObjectPath* cop, plain_join join)
{
    storage all = {};
    read_storage(all);
    const whole_paths paths = {{broker, result, all.host}, CMGetCharPtr(CMGetNameSpace(cop, nullptr))};
    if (join == plain_join::index)
        join_by_index(all, paths);
    else
        join_by_loops(all, paths, join == plain_join::loops_outer_ends_once);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_path_associator_names(const CMPIBroker* broker, const CMPIResult* result,
                                       const CMPIObjectPath* cop, plain_join join)
{
    const char* const wanted = plain_key(cop, "DeviceID");
    if (join == plain_join::index) {
        look_up_ends(broker, result, wanted);
    } else {
        storage all = {};
        read_storage(all);
        join_by_loops(all, ends_of_unit{{broker, result, all.host}, wanted}, true);
    }
    return {CMPI_RC_OK, nullptr};
}

} // namespace KPRV::bench
