// Behaviours of settings that are kept and read back: aliases, modes, trunking, authentication.
#include "simulator/Answers.h"
#include "simulator/Behaviours.h"
#include "simulator/State_Events.h"

namespace KPRV::simulator {

namespace {

Json::Value set_named(State& state, const Json::Value& request, Setting setting, const char* values_name,
                      const char* names_name)
{
    return answer_for_target(state, request, setting_row(setting).scope, [&](const Target& target) {
        const Json::Value& values = request[values_name];
        const Json::Value& names = request[names_name];
        const std::string refused =
            setting_objection(names, values, setting_of(state.inventory, setting, target));
        if (!refused.empty())
            return error_answer(Error_Code::REQUEST, refused);
        for (const Json::Value& name : names)
            kept_setting(setting, target)[name.asString()] = values[name.asString()];
        return done_answer();
    });
}

// Whether the port of the request asks its fabric for authentication; false if there is no such port.
bool is_authenticating(State& state, const Target& target)
{
    return target && setting_of(state.inventory, Setting::AUTHENTICATION, target)["enabled"] == true;
}

Json::Value set_alias(State& state, const Json::Value& request, Scope scope)
{
    const Target target = target_at(state.inventory, request["Node"], scope);
    if (!target)
        return target.refusal;
    if (!request["alias"].isString())
        return error_answer(Error_Code::REQUEST, "alias must be a text");
    (target.port ? target.port->data : target.adapter->data["hbaData"])["alias"] = request["alias"];
    return done_answer();
}

} // namespace

Json::Value setting_answer(State& state, const Json::Value& request, Setting setting)
{
    return answer_for_target(state, request, setting_row(setting).scope, [&](const Target& target) {
        return setting_of(state.inventory, setting, target);
    });
}

Json::Value set_fcoe(State& state, const Json::Value& request)
{
    return set_named(state, request, Setting::FCOE, "fcoePort", "propArray");
}

Json::Value set_fc(State& state, const Json::Value& request)
{
    return set_named(state, request, Setting::FC, "fcPortData", "paramsConfigured");
}

Json::Value set_authentication(State& state, const Json::Value& request)
{
    Json::Value values = request["portAuth"];
    if (!values.isObject())
        return error_answer(Error_Code::REQUEST, "portAuth must be an object");
    // A secret can be given, and replaced, but nobody reads it.
    Json::Value secret;
    if (values.removeMember("secret", &secret)) {
        if (!secret.isString())
            return error_answer(Error_Code::REQUEST, "secret must be a text");
        values["secretSet"] = true;
    }
    Json::Value named(request);
    named["portAuth"] = values;
    named["names"] = Json::Value(Json::arrayValue);
    for (const std::string& name : values.getMemberNames())
        named["names"].append(name);
    const Target target = find_target(state.inventory, request, Scope::FC_PORT);
    const bool was_enabled = is_authenticating(state, target);
    Json::Value answer = set_named(state, named, Setting::AUTHENTICATION, "portAuth", "names");
    const bool is_enabled = is_authenticating(state, target);
    if (is_enabled != was_enabled)
        occur(state, is_enabled ? Occurrence::AUTHENTICATION_ENABLED : Occurrence::AUTHENTICATION_DISABLED,
              *target.port);
    return answer;
}

Json::Value reset_authentication(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [](const Target& target) {
        kept_setting(Setting::AUTHENTICATION, target) = Json::Value();
        return done_answer();
    });
}

Json::Value set_adapter_mode(State& state, const Json::Value& request)
{
    const Json::Value& mode = request["adapterMode"];
    if (mode != "HBA" && mode != "CNA" && mode != "NIC")
        return error_answer(Error_Code::REQUEST, "adapterMode must be HBA, CNA or NIC");
    return answer_for_target(state, request, Scope::ADAPTER, [&](const Target& target) {
        // The ports are what they are until the host starts anew.
        kept_setting(Setting::ADVANCED_ADAPTER, target)["adapterMode"] = mode;
        return done_answer();
    });
}

Json::Value set_trunking(State& state, const Json::Value& request)
{
    const Json::Value& enable = request["enableState"];
    if (!enable.isBool())
        return error_answer(Error_Code::REQUEST, "enableState must be true or false");
    return answer_for_target(state, request, Scope::ADAPTER_OR_PORT, [&](const Target& target) {
        if (target.adapter->fc_ports.size() < 2 || !target.adapter->eth_ports.empty())
            return error_answer(Error_Code::CONFLICT, "a trunk needs an FC adapter with two ports");
        kept_setting(Setting::ADVANCED_ADAPTER, target)["trunkingEnabled"] = enable;
        return done_answer();
    });
}

Json::Value set_adapter_alias(State& state, const Json::Value& request)
{
    return set_alias(state, request, Scope::ADAPTER);
}

Json::Value set_port_alias(State& state, const Json::Value& request)
{
    return set_alias(state, request, Scope::PORT);
}

} // namespace KPRV::simulator
