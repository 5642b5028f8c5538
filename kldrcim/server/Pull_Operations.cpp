// Enumerations that a client opens and pulls. The provider is asked once, at the beginning.
#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Query_Results.h"
#include "kldrcim/wire/Class_Xml.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

// Numbers of statuses that only these operations have.
constexpr auto INVALID_CONTEXT = static_cast<CMPIrc>(21);
constexpr auto INVALID_TIMEOUT = static_cast<CMPIrc>(22);
constexpr auto FILTER_UNSUPPORTED = static_cast<CMPIrc>(25);
constexpr auto CONTINUING_UNSUPPORTED = static_cast<CMPIrc>(26);
constexpr auto LIMITS_EXCEEDED = static_cast<CMPIrc>(27);

/// More are not given at once, whatever is asked for.
constexpr std::uint64_t MOST_OBJECTS = 10000;

/// What the instances of a query are: a class with the properties that it asks for.
void write_row_class(Xml_Writer& writer, const Operation_Call& call, const Select_Query& query)
{
    Class_Info row = *call.space.classes().find(query.class_name());
    row.methods.clear();
    Class_Form form;
    form.local_only = false;
    if (!query.properties().empty())
        form.properties = query.properties();
    writer.open(Xml_Tag::PARAMVALUE).attribute(Xml_Attribute::NAME, "QueryResultClass");
    write_class(writer, call.space.classes(), row, form);
    writer.close(Xml_Tag::PARAMVALUE);
}

/// `query` is null behind what is no query, and behind each pull.
void write_end(const Operation_Call& call, const std::string& name, const Select_Query* query = nullptr)
{
    Xml_Writer& writer = call.answer.behind_values();
    if (query && call.parameters.flag("ReturnQueryResultClass", false))
        write_row_class(writer, call, *query);
    write_parameter(writer, {"EndOfSequence", Plain_Value::boolean(name.empty())});
    write_parameter(writer, {"EnumerationContext", Plain_Value::text(name)});
}

/// The next objects; those that a failure comes after in the same answer are lost, as with other operations.
Pull_Context::State write_objects(const Operation_Call& call, Pull_Context& context, std::uint64_t count)
{
    const Pull_Context::State state = context.wait(count);
    call.answer.open_values();
    for (; state != Pull_Context::FAILED && count != 0; --count) {
        const std::optional<std::string> object = context.take();
        if (!object)
            break;
        call.answer.object().written(*object);
        if (!call.answer.object_done())
            break;
    }
    return state;
}

std::chrono::seconds lifetime_of(const Parameters& parameters)
{
    const auto asked = parameters.number("OperationTimeout");
    const std::chrono::seconds lifetime =
        asked ? std::chrono::seconds(*asked) : Pull_Contexts::usual_lifetime;
    if (lifetime.count() == 0 || lifetime > Pull_Contexts::longest_lifetime)
        throw Wire_Error::status(
            INVALID_TIMEOUT, "1 to " + std::to_string(Pull_Contexts::longest_lifetime.count()) + " seconds");
    return lifetime;
}

void refuse_filters(const Parameters& parameters)
{
    if (!parameters.text("FilterQuery").empty() || !parameters.text("FilterQueryLanguage").empty())
        throw Wire_Error::status(FILTER_UNSUPPORTED, "no filters");
}

/// What each opened enumeration has: nobody asks for what there is not, and it lives for as long as it says.
std::unique_ptr<Pull_Context> new_context(const Operation_Call& call, Pull_Context::Kind kind)
{
    if (call.parameters.flag("ContinueOnError", false))
        throw Wire_Error::status(CONTINUING_UNSUPPORTED, "no continuing on errors");
    return std::make_unique<Pull_Context>(kind, call.space.name(), lifetime_of(call.parameters));
}

/// What has been started. `query` is null for what is no query.
Result write_first(const Operation_Call& call, std::unique_ptr<Pull_Context> context,
                   const Select_Query* query = nullptr)
{
    const std::uint64_t count = std::min(call.parameters.number("MaxObjectCount").value_or(0), MOST_OBJECTS);
    Pull_Contexts& contexts = call.server.pull_contexts();
    std::string name;
    if (context->wait(count) == Pull_Context::MORE) {
        // The place is taken before anything is given: what is refused must not be lost.
        name = contexts.put(std::move(context));
        context = contexts.take(name);
        if (!context)
            return failed(LIMITS_EXCEEDED, "too many open enumerations");
    }
    if (write_objects(call, *context, count) == Pull_Context::FAILED)
        return context->failure();
    if (!name.empty())
        contexts.put_back(name, std::move(context));
    write_end(call, name, query);
    return {};
}

template <Operation Kind>
Result open(const Operation_Call& call)
{
    constexpr bool enumerates =
        Kind == Operation::ENUMERATE_INSTANCES || Kind == Operation::ENUMERATE_INSTANCE_NAMES;
    constexpr bool references = Kind == Operation::REFERENCES || Kind == Operation::REFERENCE_NAMES;
    constexpr bool paths = Kind == Operation::ENUMERATE_INSTANCE_NAMES ||
                           Kind == Operation::ASSOCIATOR_NAMES || Kind == Operation::REFERENCE_NAMES;
    refuse_filters(call.parameters);
    auto context = new_context(call, paths ? Pull_Context::PATHS : Pull_Context::INSTANCES);
    Instance_Form form;
    form.properties = call.parameters.names("PropertyList");
    if (call.parameters.flag("IncludeClassOrigin", false))
        form.origins = &call.space.classes();
    Path_Value path;
    if (enumerates) {
        path.class_name = call.parameters.required_class_name("ClassName");
        if (!call.parameters.flag("DeepInheritance", true))
            form.seen_as = call.space.classes().find(path.class_name);
    } else {
        path = call.path("InstanceName");
    }
    Request request = call.request(Kind, std::move(path));
    request.properties = form.properties;
    request.filter.result_class = call.parameters.class_name("ResultClass");
    request.filter.role = call.parameters.text("Role");
    if (!references) {
        request.filter.association_class = call.parameters.class_name("AssocClass");
        request.filter.result_role = call.parameters.text("ResultRole");
    }
    context->start({Object_Text::PULLED, std::move(form), call.space.name(), call.server.host_name()},
                   [&space = call.space, request = std::move(request)](Receiver& receiver) {
                       return space.run(request, &receiver);
                   });
    return write_first(call, std::move(context));
}

Result open_query(const Operation_Call& call)
{
    const Select_Query query = read_query(call, "FilterQueryLanguage", "FilterQuery");
    Request request = call.request(Operation::ENUMERATE_INSTANCES, {.class_name = query.class_name()});
    auto context = new_context(call, Pull_Context::ROWS);
    context->start({Object_Text::BARE},
                   [&space = call.space, request = std::move(request), query](Receiver& receiver) {
                       Query_Results selected(query, space.classes(), receiver);
                       return space.run(request, &selected);
                   });
    return write_first(call, std::move(context), &query);
}

std::unique_ptr<Pull_Context> taken(const Operation_Call& call, const std::string& name)
{
    call.parameters.required("EnumerationContext");
    auto context = call.server.pull_contexts().take(name);
    if (!context)
        throw Wire_Error::status(INVALID_CONTEXT, "no open enumeration " + name.substr(0, 64));
    if (same_name(context->name_space, call.space.name()))
        return context;
    call.server.pull_contexts().put_back(name, std::move(context));
    throw Wire_Error::status(INVALID_CONTEXT, "the enumeration is one of another namespace");
}

template <Pull_Context::Kind Kind>
Result pull(const Operation_Call& call)
{
    call.parameters.required("MaxObjectCount");
    const std::uint64_t count = std::min(*call.parameters.number("MaxObjectCount"), MOST_OBJECTS);
    const std::string name = call.parameters.text("EnumerationContext");
    auto context = taken(call, name);
    if (context->kind != Kind) {
        call.server.pull_contexts().put_back(name, std::move(context));
        return failed(INVALID_CONTEXT, "the enumeration is of another kind");
    }
    const Pull_Context::State state = write_objects(call, *context, count);
    if (state == Pull_Context::FAILED)
        return context->failure();
    if (state == Pull_Context::MORE)
        call.server.pull_contexts().put_back(name, std::move(context));
    write_end(call, state == Pull_Context::MORE ? name : std::string());
    return {};
}

Result close(const Operation_Call& call)
{
    taken(call, call.parameters.text("EnumerationContext"));
    return {};
}

#define COMMON "OperationTimeout ContinueOnError MaxObjectCount FilterQueryLanguage FilterQuery"
// clang-format off
constexpr Operation_Row pull_rows[] = {
    {"OpenEnumerateInstances",     "ClassName DeepInheritance IncludeClassOrigin PropertyList " COMMON, true, open<Operation::ENUMERATE_INSTANCES>},
    {"OpenEnumerateInstancePaths", "ClassName " COMMON,                                                 true, open<Operation::ENUMERATE_INSTANCE_NAMES>},
    {"OpenAssociatorInstances",    "InstanceName AssocClass ResultClass Role ResultRole IncludeClassOrigin PropertyList " COMMON, true, open<Operation::ASSOCIATORS>},
    {"OpenAssociatorInstancePaths", "InstanceName AssocClass ResultClass Role ResultRole " COMMON,      true, open<Operation::ASSOCIATOR_NAMES>},
    {"OpenReferenceInstances",     "InstanceName ResultClass Role IncludeClassOrigin PropertyList " COMMON, true, open<Operation::REFERENCES>},
    {"OpenReferenceInstancePaths", "InstanceName ResultClass Role " COMMON,                             true, open<Operation::REFERENCE_NAMES>},
    {"OpenQueryInstances",         "ReturnQueryResultClass " COMMON,                                    true, open_query},
    {"PullInstancesWithPath",      "EnumerationContext MaxObjectCount",                                 true, pull<Pull_Context::INSTANCES>},
    {"PullInstancePaths",          "EnumerationContext MaxObjectCount",                                 true, pull<Pull_Context::PATHS>},
    {"PullInstances",              "EnumerationContext MaxObjectCount",                                 true, pull<Pull_Context::ROWS>},
    {"CloseEnumeration",           "EnumerationContext",                                                false, close},
};
// clang-format on
#undef COMMON

} // namespace

std::span<const Operation_Row> pull_operations()
{
    return pull_rows;
}

} // namespace KPRV::kldrcim
