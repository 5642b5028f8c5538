#pragma once

#include "module/agent/Method.h"

namespace KPRV {

/// What methods do beyond the table: the shapes that Methods.def names.
struct Method_Shapes
{
#define SHAPE(name) static void name(const Method& method, const Json::Value& params, Json::Value& result)

    // Shared by many.

    /// The query is sent; the answer is the result.
    SHAPE(assigned);
    /// The query is sent; the result is an array of the answer alone.
    SHAPE(wrapped);
    /// "params" are sent as they are; the answer is the result.
    SHAPE(passed_on);

    // Of single methods.

    /// The answer, completed with manufacturer and model by a hypervisor's CIM classes.
    SHAPE(host_completed);
    /// The answers for all adapters of the host.
    SHAPE(each_adapter);
    /// The answers for all ports of one adapter.
    SHAPE(each_port);
    /// An alias goes to the entry point of its type.
    SHAPE(alias_of_type);
    /// The same with each alias of an array; the result is the array of the answers.
    SHAPE(each_alias);
    /// Two lists of an object and a switch, absent ones too.
    SHAPE(lun_masks);
    /// Up to two lists of an object, at least one.
    SHAPE(io_profiles);
    /// A reset for each port of an array; the result is the array of the answers that came.
    SHAPE(each_port_reset);
    /// A test posted for each target of an array; the result is the last answer.
    SHAPE(each_target);
    /// A number of the library's own.
    SHAPE(request_id);

#undef SHAPE
};

} // namespace KPRV
