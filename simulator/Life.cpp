// Behaviours of the library itself: start, end, version, events, what is accepted and what is not
// supported.
#include "simulator/Answers.h"
#include "simulator/Behaviours.h"

namespace KPRV::simulator {

Json::Value init_hba_lib(State& state, const Json::Value&)
{
    if (!state.problem.empty())
        return error_answer(Error_Code::INVENTORY, state.problem);
    state.session.initialised = true;
    return state.inventory.init;
}

Json::Value free_hba_lib(State& state, const Json::Value&)
{
    // The caller is leaving memory, so its callbacks must never be called again. The next caller
    // finds what the environment then names, but keeps an inventory that a test gave.
    state.session = {};
    state.events.reset();
    state.loaded = !state.from_environment;
    return 0;
}

Json::Value library_version(State& state, const Json::Value&)
{
    return state.inventory.version;
}

Json::Value accept(State&, const Json::Value&)
{
    return {};
}

Json::Value register_for_events(State& state, const Json::Value& request)
{
    const Json::Value& drop_old_events = request["dropOldEvents"];
    if (!drop_old_events.isBool())
        return error_answer(Error_Code::REQUEST, "dropOldEvents must be true or false");
    state.events.want(drop_old_events.asBool());
    return done_answer();
}

Json::Value unregister_for_events(State& state, const Json::Value&)
{
    state.events.want_no_more();
    return done_answer();
}

Json::Value next_request_id(State& state, const Json::Value&)
{
    return ++state.last_request_id;
}

Json::Value unsupported(State&, const Json::Value&)
{
    return error_answer(Error_Code::UNSUPPORTED, "not supported");
}

} // namespace KPRV::simulator
