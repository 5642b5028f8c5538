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

Json::Value register_for_events(State& state, const Json::Value&)
{
    state.session.wants_events = true;
    return done_answer();
}

Json::Value unregister_for_events(State& state, const Json::Value&)
{
    state.session.wants_events = false;
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
