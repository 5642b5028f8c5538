#pragma once

#include "module/adapter/CIMProviderZntj.h"

#include <json/value.h>

namespace KPRV {

/// One member of a query: an item of a row of Methods.def.
struct Method_Member
{
    enum Kind
    {
        END,
        // These take the next position of "params".
        STRING,
        INTEGER,
        BOOLEAN,
        ARRAY,
        OBJECT,
        ADDRESS,
        OWN,
        UNREAD,
        // These are constants.
        ZERO,
        TEXT,
    };

    Kind kind = END;
    const char* key = nullptr;
    const char* text = nullptr;

    constexpr bool takes_position() const { return kind > END && kind < ZERO; }
};

/// A row of Methods.def.
struct Method
{
    /// What is done with the entry point and its answer; `params` has the right number of elements.
    using Shape = void (*)(const Method& method, const Json::Value& params, Json::Value& result);

    const char* handler;
    Shape shape;
    /// Null if it takes no JSON: the shape then knows it.
    const JsonReqFP* entry;
    /// Up to the first of kind END.
    Method_Member members[10];

    /// How many elements "params" must have. With none, they may have any.
    constexpr unsigned count() const
    {
        unsigned n = 0;
        for (const Method_Member& member : members)
            n += member.takes_position();
        return n;
    }
    /// Calls the entry point.
    Json::Value ask(const Json::Value& query) const { return (*entry)(query); }
};

constexpr const JsonReqFP* entry_of(const JsonReqFP& entry)
{
    return &entry;
}
constexpr const JsonReqFP* entry_of(const voidRetIntFP&)
{
    return nullptr;
}

/// Runs a method: counts the parameters, then leaves the rest to its shape.
void call(const Method& method, const Json::Value& params, Json::Value& result);

/// The query of a row: its constants, and the parameters that it names, converted in their order.
Json::Value query_of(const Method& method, const Json::Value& params);
/// The parameter that the row leaves to the method's own shape.
const Json::Value& own_parameter(const Method& method, const Json::Value& params);

/// The value itself if it is an array, or null; `ErrorBadJsonArray` if not.
const Json::Value& checked_array(const Json::Value& value);
/// The value itself if it is an object, or null; `ErrorBadJsonObject` if not.
const Json::Value& checked_object(const Json::Value& value);

} // namespace KPRV
