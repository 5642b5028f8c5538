// Of `Method_Shapes`, those of methods that put an answer together of many: the host, its adapters, their
// ports.
#include "module/agent/Method_Shapes.h"

#include "module/adapter/Json_Access.h"
#include "module/agent/ProviderDiscoveryMethods.h"
#include "module/runtime/ground/strutil.h"
#include "module/runtime/system/log.h"

#include <stdexcept>

namespace KPRV {

namespace {

bool is_text(const Json::Value& value)
{
    return value.isString() && !asString(value).empty();
}

Json::Value query(const char* key, const Json::Value& address)
{
    Json::Value result;
    result[key] = asString(address);
    return result;
}

/// A converged adapter goes by its MAC, and so does one with Ethernet ports alone.
Json::Value adapter_of(const Json::Value& record)
{
    const auto has = [&](const char* kind) { return asBool(member(record, kind)); };
    const bool by_mac = has("cna") || (!has("fc") && !has("fcoe") && has("ethPort"));
    return by_mac ? libGetHbaByMac(query("mac", member(record, "mac")))
                  : libGetHbaByWwn(query("wwn", member(record, "wwn")));
}

struct Port_Kind
{
    const char* flags;
    const char* key;
    const char* addresses;
};

/// The first kind that a port has.
constexpr Port_Kind port_kinds[] = {
    {"portHasFc", "wwn", "portWwn"},
    {"portHasEth", "mac", "portMac"},
    {"portHasFcoe", "mac", "fcoeMac"},
};

/// Null for a port of no kind: the library is asked all the same.
Json::Value port_query(const Json::Value& record, unsigned port)
{
    for (const Port_Kind& kind : port_kinds) {
        if (asBool(element(member(record, kind.flags), port)))
            return query(kind.key, element(member(record, kind.addresses), port));
    }
    return Json::Value();
}

bool same_address(const std::string& a, const std::string& b)
{
    return a.size() == b.size() && folded_eq(a.data(), b.data(), a.size());
}

void append_ports(const Json::Value& record, Json::Value& result)
{
    const int ports = asInt(member(record, "numOfPorts"));
    if (ports <= 0)
        throw std::runtime_error("Unable to find any Port attributes");
    for (int port = 0; port < ports; port++)
        result.append(libGetPortByWwn(port_query(record, unsigned(port))));
}

} // namespace

void Method_Shapes::host_completed(const Method& method, const Json::Value& params, Json::Value& result)
{
    result = method.ask(params);
    const Json::Value& host = member(result, "result");
    if (hasMember(host, "error"))
        return;
    if (is_text(member(host, "hostManufacturer")) && is_text(member(host, "hostModel")))
        return;
    const Array<String> known = ProviderDiscoveryMethods::getOtherIdentifyingInfo();
    // Either way (constant): there are both, or none.
    if (known.size() < 2)
        return;
    // Beside the inner object, not inside: clients look for them there, and the inner texts stay empty.
    result["hostManufacturer"] = known[0].c_str();
    result["hostModel"] = known[1].c_str();
}

void Method_Shapes::each_adapter(const Method& method, const Json::Value& params, Json::Value& result)
{
    const Json::Value info = method.ask(params);
    const int adapters = asInt(member(info, "numOfAdapters"));
    LOG(DBG, "numOfAdapters=%d", adapters);
    // Without adapters the result stays null, and is no empty array.
    for (int i = 0; i < adapters; i++)
        result.append(adapter_of(element(member(info, "adapter"), unsigned(i))));
}

void Method_Shapes::each_port(const Method& method, const Json::Value& params, Json::Value& result)
{
    const std::string address = asString(own_parameter(method, params));
    const Json::Value info = method.ask(params);
    const int adapters = asInt(member(info, "numOfAdapters"));
    for (int i = 0; i < adapters; i++) {
        const Json::Value& record = element(member(info, "adapter"), unsigned(i));
        if (same_address(address, asString(member(record, "wwn"))) ||
            same_address(address, asString(member(record, "mac"))))
            return append_ports(record, result);
    }
}

} // namespace KPRV
