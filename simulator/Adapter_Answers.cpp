// Behaviours of adapters: their addresses, ids, data, flash and state.
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"
#include "simulator/State_Events.h"

namespace KPRV::simulator {

namespace {

template <typename Answer>
Json::Value answer_for_adapter(State& state, const Json::Value& address, Answer answer)
{
    return answer_at(state.inventory.adapter_at(address.asString()), address,
                     [&](const Inventory::Place& place) { return answer(*place.adapter); });
}

Json::Value id_answer(State& state, const Adapter& adapter)
{
    Json::Value answer;
    answer["adapterId"] = state.inventory.adapter_id(adapter);
    return answer;
}

} // namespace

Json::Value adapter_addresses(State& state, const Json::Value&)
{
    Json::Value answer;
    answer["indexStrings"] = Json::Value(Json::arrayValue);
    for (const Adapter& adapter : state.inventory.adapters)
        answer["indexStrings"].append(adapter.address);
    return answer;
}

Json::Value adapter_id(State& state, const Json::Value& request)
{
    return answer_for_adapter(state, request["indexStr"],
                              [&](const Adapter& adapter) { return id_answer(state, adapter); });
}

Json::Value adapter_id_by_port(State& state, const Json::Value& request)
{
    const Json::Value& address = request["indexStr"];
    return answer_at(state.inventory.port_at(address.asString()), address,
                     [&](const Inventory::Place& place) { return id_answer(state, *place.adapter); });
}

Json::Value adapter_data(State& state, const Json::Value& request)
{
    return answer_for_adapter(state, wwn_or_mac(request),
                              [](const Adapter& adapter) { return adapter.data; });
}

Json::Value flash_info(State& state, const Json::Value& request)
{
    return answer_for_adapter(state, request["indexStr"], [](const Adapter& adapter) {
        Json::Value answer(Json::objectValue);
        if (!adapter.flash_status.isNull())
            answer["flashStatus"] = adapter.flash_status;
        return answer;
    });
}

Json::Value set_adapter_state(State& state, const Json::Value& request)
{
    const Json::Value& enable = request["enableState"];
    if (!enable.isBool())
        return error_answer(Error_Code::REQUEST, "enableState must be true or false");
    return answer_for_adapter(state, request["indexStr"], [&](Adapter& adapter) {
        Json::Value& status = adapter.data["hbaData"]["hbaStatus"];
        if (status != enable)
            occur(state, enable.asBool() ? Occurrence::FIRMWARE_STARTED : Occurrence::FIRMWARE_STOPPED,
                  adapter);
        status = enable;
        return done_answer();
    });
}

} // namespace KPRV::simulator
