#include "module/alerts/Adapter_Event.h"

#include "module/adapter/Json_Access.h"
#include "module/adapter/Json_Reading.h"
#include "module/runtime/system/log.h"

namespace KPRV {

namespace {

/// Only such names are known to clients; any other is dropped.
constexpr const char symbol_prefix[] = "ZNT_";

String text(const Json::Value& object, const char* name)
{
    return asString(member(object, name)).c_str();
}

std::optional<String> text_if_present(const Json::Value& object, const char* name)
{
    return hasMember(object, name) ? std::optional(text(object, name)) : std::nullopt;
}

bool has_required(const Json::Value& object, const char* name)
{
    if (hasMember(object, name))
        return true;
    LOG(WARN, "%s is a must in the eventObject. Return error", name);
    return false;
}

} // namespace

bool read_adapter_event(const char* json, Adapter_Event& event)
{
    Json::Value object;
    std::string errors;
    if (!read_json(json ? json : "", object, errors)) {
        LOG(WARN, "Unable to parse json string to object. Return error");
        return false;
    }
    if (!has_required(object, "eventCategory") || !has_required(object, "eventId"))
        return false;
    event.category = asInt(member(object, "eventCategory"));
    event.id = asInt(member(object, "eventId"));
    event.port_index = text(object, "portIndexString");
    event.base_port_wwn = text(object, "basePortWWN");
    event.message = text(object, "eventMsg");
    event.symbol = text(object, "eventIdValue");
    if (!event.symbol.equal(0, symbol_prefix, sizeof symbol_prefix - 1))
        event.symbol.clear();
    event.severity = asInt(member(object, "eventSeverity"));
    event.pom_level = text_if_present(object, "pomLevel");
    event.fabric_wwn = text_if_present(object, "fWwn");
    event.cee_state = text_if_present(object, "cee_state");
    return true;
}

} // namespace KPRV
