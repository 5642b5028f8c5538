#pragma once

#include "tests/bench/plain_library.h"
#include "tests/bench/plain_support.h"

#include <cstring>

namespace KPRV::bench {

// The library's answers one by one, as plain providers walk them: the module's calls with the module's
// requests, in its order.

/// `visit(answer)` for each adapter that can be read.
template <class Visit>
void plain_for_each_adapter(Visit visit)
{
    const plain_library& library = plain_library::get();
    const Json::Value adapters = library.get_adapters(Json::Value());
    if (plain_is_bad(adapters))
        return;
    for (const Json::Value& address : adapters["indexStrings"]) {
        constexpr size_t MAC_SIZE = 17;
        Json::Value request;
        request[plain_view(address).size() == MAC_SIZE ? "mac" : "wwn"] = address;
        const Json::Value answer = library.get_adapter(request);
        if (!plain_is_bad(answer))
            visit(answer);
    }
}

/// `visit(number, answer)` for each FC port of an adapter that can be read.
template <class Visit>
void plain_for_each_port_of(const Json::Value& adapter, Visit visit)
{
    const plain_library& library = plain_library::get();
    Json::Value request, port_request;
    request["indexStr"] = adapter;
    const Json::Value ports = library.get_fc_ports(request);
    if (plain_is_bad(ports))
        return;
    int number = -1;
    for (const Json::Value& wwn : ports["indexStrings"]) {
        number++;
        port_request["wwn"] = wwn;
        const Json::Value answer = library.get_port(port_request);
        if (!plain_is_bad(answer))
            visit(number, answer);
    }
}

/// `visit(number, answer)` for each FC port of the host.
template <class Visit>
void plain_for_each_port(Visit visit)
{
    const Json::Value adapters = plain_library::get().get_adapters(Json::Value());
    if (plain_is_bad(adapters))
        return;
    for (const Json::Value& adapter : adapters["indexStrings"])
        plain_for_each_port_of(adapter, visit);
}

/// What a port sees through the fabric, by the name that its endpoint has.
struct plain_target
{
    char name[48]; ///< Address of the port, "_" and its own, both without colons.
    size_t port_size;
    size_t size;
    const Json::Value& answer;

    bool is_tape() const
    {
        const std::string_view type = plain_view(answer["deviceData"]["type"]);
        return type == "Tape" || type == "Media Changer";
    }
};

/// `visit(target)` for each target that a port sees.
template <class Visit>
void plain_for_each_target(const Json::Value& port, Visit visit)
{
    const plain_library& library = plain_library::get();
    Json::Value request;
    request["pPortWwn"] = port;
    request["lPortWwn"] = port;
    const Json::Value remotes = library.get_remote_ports(request);
    if (!remotes.isArray())
        return;
    for (const Json::Value& remote : remotes) {
        const Json::Value& wwn = remote["remotePortWwn"];
        request["rPortWwn"] = wwn;
        const Json::Value answer = library.get_remote_port(request);
        if (plain_is_bad(answer) || !answer["deviceData"]["isTarget"].asBool())
            continue;
        plain_target target = {{}, 0, 0, answer};
        target.port_size = plain_flat(target.name, sizeof target.name - 1, port.asCString());
        target.name[target.port_size] = '_';
        target.size = target.port_size + 1;
        target.size +=
            plain_flat(target.name + target.size, sizeof target.name - target.size, wwn.asCString());
        visit(target);
    }
}

} // namespace KPRV::bench
