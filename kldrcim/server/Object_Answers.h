#pragma once

#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Object_Relay.h"
#include "kldrcim/server/Object_Text.h"

namespace KPRV::kldrcim {

/// Writes objects into the answer as a provider hands them over; of many, while it makes the next.
class Object_Answers final : public Receiver
{
public:
    Object_Answers(const Operation_Call& call, Instance_Form form, Object_Text::Kind kind)
        : _call(call), _text{kind, std::move(form), call.space.name(), call.server.host_name()}
    {
    }

    /// What nobody reads any more is no failure: the connection is gone.
    Result run(Request request)
    {
        Result result = _call.space.run(std::move(request), this);
        _relay.finish();
        return result;
    }

    bool instance(Instance_Value&& instance) override { return _relay.put(std::move(instance)); }
    bool path(Path_Value&& path) override { return _relay.put(std::move(path)); }

private:
    bool write(Object_Relay::Object& object)
    {
        std::visit([&](auto& each) { _text.write(_call.answer.object(), std::move(each)); }, object);
        return _call.answer.object_done();
    }

    const Operation_Call& _call;
    const Object_Text _text;
    Object_Relay _relay{[this](Object_Relay::Object& object) { return write(object); }};
};

} // namespace KPRV::kldrcim
