#pragma once

#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Select_Query.h"

namespace KPRV::kldrcim {

/// The query in two parameters of an operation. Throws `Wire_Error`: status 4 without one, 14 for its
/// language, 15 for itself, 5 for a class that there is not.
Select_Query read_query(const Operation_Call& call, const char* language, const char* query);

/// Lets through what a query selects, with the properties that it asks for.
class Query_Results final : public Receiver
{
public:
    Query_Results(const Select_Query& query, const Class_Catalogue& classes, Receiver& next)
        : _query(query), _classes(classes), _next(next)
    {
    }

    bool instance(Instance_Value&& instance) override;
    bool path(Path_Value&&) override { return true; }

private:
    const Select_Query& _query;
    const Class_Catalogue& _classes;
    Receiver& _next;
};

} // namespace KPRV::kldrcim
