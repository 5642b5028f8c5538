#pragma once

#include "kldrcim/server/Cim_Server.h"

namespace KPRV::kldrcim {

/// Writes objects into the answer as a provider hands them over.
class Object_Answers final : public Receiver
{
public:
    enum Form
    {
        /// Instance and its name; names alone.
        NAMED,
        /// With host and name space, as associations and the older queries give them.
        OBJECTS,
        /// The same for operations that are pulled.
        PULLED,
        /// Instances alone, as queries give them that are pulled.
        BARE,
    };

    Object_Answers(const Operation_Call& call, Instance_Form form, Form kind)
        : _call(call), _form(std::move(form)), _kind(kind)
    {
    }

    /// What nobody reads any more is no failure: the connection is gone.
    Result run(Request request) { return _call.space.run(std::move(request), this); }

    bool instance(Instance_Value&& instance) override;
    bool path(Path_Value&& path) override;

private:
    void place(Path_Value& path) const;

    const Operation_Call& _call;
    Instance_Form _form;
    Form _kind;
};

} // namespace KPRV::kldrcim
