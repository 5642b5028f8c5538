// Queries for instances. Those that a client pulls stand with the other pulled enumerations.
#include "kldrcim/server/Object_Answers.h"
#include "kldrcim/server/Query_Results.h"

namespace KPRV::kldrcim {

Select_Query read_query(const Operation_Call& call, const char* language, const char* query)
{
    call.parameters.required(language);
    call.parameters.required(query);
    Query_Error error;
    const auto parsed =
        Select_Query::parse(call.parameters.text(query), call.parameters.text(language), error);
    if (!parsed)
        throw Wire_Error::status(error.rc, error.text);
    const Class_Info* info = call.space.classes().find(parsed->class_name());
    if (!info)
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_CLASS, parsed->class_name());
    if (const std::string unknown = parsed->unknown_property(*info); !unknown.empty())
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_QUERY, info->name + " has no property " + unknown);
    return *parsed;
}

bool Query_Results::instance(Instance_Value&& instance)
{
    if (!_query.matches(instance, _classes))
        return true;
    _query.project(instance);
    return _next.instance(std::move(instance));
}

namespace {

Result exec_query(const Operation_Call& call)
{
    const Select_Query query = read_query(call, "QueryLanguage", "Query");
    call.answer.open_values();
    Object_Answers receiver(call, {}, Object_Text::OBJECTS);
    Query_Results selected(query, call.space.classes(), receiver);
    return call.space.run(call.request(Operation::ENUMERATE_INSTANCES, {.class_name = query.class_name()}),
                          &selected);
}

constexpr Operation_Row query_rows[] = {
    {"ExecQuery", "QueryLanguage Query", true, exec_query},
};

} // namespace

std::span<const Operation_Row> query_operations()
{
    return query_rows;
}

} // namespace KPRV::kldrcim
