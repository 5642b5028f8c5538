#pragma once

#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Object_Text.h"

namespace KPRV::kldrcim {

/// Writes objects into the answer as a provider hands them over.
class Object_Answers final : public Receiver
{
public:
    Object_Answers(const Operation_Call& call, Instance_Form form, Object_Text::Kind kind)
        : _call(call), _text{kind, std::move(form), call.space.name(), call.server.host_name()}
    {
    }

    /// What nobody reads any more is no failure: the connection is gone.
    Result run(Request request) { return _call.space.run(std::move(request), this); }

    bool instance(Instance_Value&& instance) override { return write(std::move(instance)); }
    bool path(Path_Value&& path) override { return write(std::move(path)); }

private:
    template <class Object>
    bool write(Object&& object)
    {
        _text.write(_call.answer.object(), std::forward<Object>(object));
        return _call.answer.object_done();
    }

    const Operation_Call& _call;
    const Object_Text _text;
};

} // namespace KPRV::kldrcim
