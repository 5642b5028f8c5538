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
        : call_(call), form_(std::move(form)), kind_(kind)
    {
    }

    /// What nobody reads any more is no failure: the connection is gone.
    Result run(Request request) { return call_.space.run(std::move(request), this); }

    bool instance(Instance_Value&& instance) override;
    bool path(Path_Value&& path) override;

private:
    void place(Path_Value& path) const;

    const Operation_Call& call_;
    Instance_Form form_;
    Form kind_;
};

} // namespace KPRV::kldrcim
