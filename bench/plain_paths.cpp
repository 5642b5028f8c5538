#include "bench/Plain_Provider.h"
#include "bench/plain_support.h"

#include <cstdio>
#include <cstring>
#include <string>
#include <strings.h>
#include <vector>

namespace KPRV::bench {

namespace {

/// An initiator is named by its port, a target by its port, "_" and its own address.
struct endpoint
{
    char name[48];
    size_t initiator_size;
};

/// A unit's id begins with the name of the target behind which it stands, and "_".
struct unit
{
    std::string id;
    size_t target_size;
};

struct storage
{
    char host[256];
    std::vector<endpoint> initiators, targets;
    std::vector<unit> units;
};

template <class Callback>
void for_each_port(Callback callback)
{
    const Fast_Library& library = Fast_Library::get();
    const Json::Value adapters = library.get_adapters(Json::Value());
    for (const Json::Value& adapter : adapters["indexStrings"]) {
        Json::Value request;
        request["indexStr"] = adapter;
        const Json::Value ports = library.get_fc_ports(request);
        for (const Json::Value& wwn : ports["indexStrings"]) {
            Json::Value port_request;
            port_request["wwn"] = wwn;
            const Json::Value answer = library.get_port(port_request);
            if (!plain_is_bad(answer))
                callback(answer["wwn"].asCString());
        }
    }
}

template <class Callback>
void for_each_remote_port(const char* port, Callback callback)
{
    const Fast_Library& library = Fast_Library::get();
    Json::Value request;
    request["pPortWwn"] = port;
    request["lPortWwn"] = port;
    const Json::Value remotes = library.get_remote_ports(request);
    for (const Json::Value& remote : remotes) {
        request["rPortWwn"] = remote["remotePortWwn"];
        const Json::Value answer = library.get_remote_port(request);
        if (!plain_is_bad(answer) && answer["deviceData"]["isTarget"].asBool())
            callback(remote["remotePortWwn"].asCString(), answer);
    }
}

std::string target_name(const char* port, const char* remote)
{
    char local_flat[24], remote_flat[24];
    plain_flat(local_flat, sizeof local_flat, port);
    plain_flat(remote_flat, sizeof remote_flat, remote);
    return std::string(local_flat) + "_" + remote_flat;
}

/// The units of tape drives or of all others.
void read_units(bool tapes, std::vector<unit>& units)
{
    for_each_port([&](const char* port) {
        for_each_remote_port(port, [&](const char* remote, const Json::Value& answer) {
            if ((strcmp(answer["deviceData"]["type"].asCString(), "Tape") == 0) != tapes)
                return;
            const std::string target = target_name(port, remote);
            for (const Json::Value& lun : answer["lunList"]) {
                char rest[64];
                snprintf(rest, sizeof rest, "_%s_%s_LUN_%u", lun["vendor"].asCString(),
                         lun["productID"].asCString(), lun["number"].asUInt());
                units.push_back({target + rest, target.size()});
            }
        });
    });
}

void read_endpoints(storage& all)
{
    for_each_port([&](const char* port) {
        endpoint initiator;
        plain_flat(initiator.name, sizeof initiator.name, port);
        initiator.initiator_size = strlen(initiator.name);
        all.initiators.push_back(initiator);
        for_each_remote_port(port, [&](const char* remote, const Json::Value&) {
            endpoint target;
            snprintf(target.name, sizeof target.name, "%s", target_name(port, remote).c_str());
            target.initiator_size = initiator.initiator_size;
            all.targets.push_back(target);
        });
    });
}

void read_storage(storage& all)
{
    plain_host_name(all.host, sizeof all.host);
    read_units(false, all.units);
    read_units(true, all.units);
    read_endpoints(all);
}

CMPIObjectPath* path_to(const CMPIBroker* broker, const storage& all, const endpoint& endpoint)
{
    return plain_device_path(broker, "KALDERA_SCSIProtocolEndpoint", all.host, "Name", endpoint.name);
}

CMPIObjectPath* path_to(const CMPIBroker* broker, const storage& all, const unit& unit)
{
    return plain_device_path(broker, "KALDERA_StorageExtent", all.host, "DeviceID", unit.id.c_str());
}

/// The three loops. Sizes are compared before texts.
template <class On_Path>
void join(const CMPIBroker* broker, const storage& all, plain_ends ends, On_Path on_path)
{
    for (const endpoint& initiator : all.initiators) {
        CMPIObjectPath* from = path_to(broker, all, initiator);
        for (const endpoint& target : all.targets) {
            if (target.initiator_size != initiator.initiator_size ||
                strncasecmp(target.name, initiator.name, initiator.initiator_size) != 0)
                continue;
            CMPIObjectPath* through = path_to(broker, all, target);
            const size_t size = strlen(target.name);
            for (const unit& unit : all.units) {
                if (unit.target_size != size || strncasecmp(unit.id.c_str(), target.name, size) != 0)
                    continue;
                if (ends == plain_ends::of_each_path) {
                    from = path_to(broker, all, initiator);
                    through = path_to(broker, all, target);
                }
                on_path(from, through, unit);
            }
        }
    }
}

void add_end(CMPIObjectPath* path, const char* role, CMPIObjectPath* end)
{
    CMPIValue value = {};
    value.ref = end;
    CMAddKey(path, role, &value, CMPI_ref);
}

void set_end(CMPIInstance* instance, const char* role, CMPIObjectPath* end)
{
    CMPIValue value = {};
    value.ref = end;
    CMSetProperty(instance, role, &value, CMPI_ref);
}

} // namespace

CMPIStatus plain_enumerate_paths(const CMPIBroker* broker, const CMPIResult* result,
                                 const CMPIObjectPath* cop, plain_ends ends)
{
    storage all = {};
    read_storage(all);
    const char* const name_space = CMGetCharPtr(CMGetNameSpace(cop, nullptr));
    join(broker, all, ends, [&](CMPIObjectPath* initiator, CMPIObjectPath* target, const unit& unit) {
        CMPIObjectPath* const to = path_to(broker, all, unit);
        CMPIObjectPath* const path =
            CMNewObjectPath(broker, name_space, "KALDERA_SCSIInitiatorTargetLogicalUnitPath", nullptr);
        add_end(path, "Initiator", initiator);
        add_end(path, "Target", target);
        add_end(path, "LogicalUnit", to);
        CMPIInstance* const instance = CMNewInstance(broker, path, nullptr);
        set_end(instance, "Initiator", initiator);
        set_end(instance, "Target", target);
        set_end(instance, "LogicalUnit", to);
        CMReturnInstance(result, instance);
    });
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_path_associator_names(const CMPIBroker* broker, const CMPIResult* result,
                                       const CMPIObjectPath* cop)
{
    storage all = {};
    read_storage(all);
    const char* const wanted = plain_key(cop, "DeviceID");
    join(broker, all, plain_ends::once,
         [&](CMPIObjectPath* initiator, CMPIObjectPath* target, const unit& unit) {
             if (unit.id != wanted)
                 return;
             CMReturnObjectPath(result, initiator);
             CMReturnObjectPath(result, target);
         });
    return {CMPI_RC_OK, nullptr};
}

} // namespace KPRV::bench
