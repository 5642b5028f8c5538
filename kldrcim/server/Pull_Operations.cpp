// Enumerations that a client opens and pulls. The provider is asked once, at the beginning: it may hold locks
// while it hands objects over, and no client's pace may hold up the others.
#include "kldrcim/server/Object_Answers.h"
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

/// The next objects.
void write_objects(const Operation_Call& call, Pull_Context& context, std::uint64_t count)
{
    Instance_Form form;
    form.properties = context.properties;
    form.seen_as = context.seen_as.empty() ? nullptr : call.space.classes().find(context.seen_as);
    form.origins = context.with_origins ? &call.space.classes() : nullptr;
    const bool is_row = context.kind == Pull_Context::ROWS;
    Object_Answers receiver(call, form, is_row ? Object_Answers::BARE : Object_Answers::PULLED);
    call.answer.open_values();
    for (; count != 0 && !context.instances.empty(); --count) {
        receiver.instance(std::move(context.instances.front()));
        context.instances.pop_front();
    }
    for (; count != 0 && !context.paths.empty(); --count) {
        receiver.path(std::move(context.paths.front()));
        context.paths.pop_front();
    }
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
    auto context = std::make_unique<Pull_Context>();
    context->kind = kind;
    context->lifetime = lifetime_of(call.parameters);
    return context;
}

/// `query` is null for what is no query.
Result open_and_write(const Operation_Call& call, Request request, std::unique_ptr<Pull_Context> context,
                      const Select_Query* query = nullptr)
{
    const std::uint64_t count = std::min(call.parameters.number("MaxObjectCount").value_or(0), MOST_OBJECTS);
    Collector collector;
    std::optional<Query_Results> selected;
    if (query)
        selected.emplace(*query, call.space.classes(), collector);
    Result result =
        call.space.run(std::move(request), selected ? static_cast<Receiver*>(&*selected) : &collector);
    if (!result.ok())
        return result;
    std::ranges::move(collector.instances, std::back_inserter(context->instances));
    std::ranges::move(collector.paths, std::back_inserter(context->paths));
    context->name_space = call.space.name();
    if (context->size() <= count) {
        write_objects(call, *context, count);
        write_end(call, {}, query);
        return {};
    }
    // The place is taken before anything is given: what is refused must not be lost.
    Pull_Contexts& contexts = call.server.pull_contexts();
    const std::string name = contexts.put(std::move(context));
    context = contexts.take(name);
    if (!context)
        return failed(LIMITS_EXCEEDED, "too many open enumerations");
    write_objects(call, *context, count);
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
    context->properties = call.parameters.names("PropertyList");
    context->with_origins = call.parameters.flag("IncludeClassOrigin", false);
    Path_Value path;
    if (enumerates) {
        path.class_name = call.parameters.required_class_name("ClassName");
        if (!call.parameters.flag("DeepInheritance", true))
            context->seen_as = path.class_name;
    } else {
        path = call.path("InstanceName");
    }
    Request request = call.request(Kind, std::move(path));
    request.properties = context->properties;
    request.filter.result_class = call.parameters.class_name("ResultClass");
    request.filter.role = call.parameters.text("Role");
    if (!references) {
        request.filter.association_class = call.parameters.class_name("AssocClass");
        request.filter.result_role = call.parameters.text("ResultRole");
    }
    return open_and_write(call, std::move(request), std::move(context));
}

Result open_query(const Operation_Call& call)
{
    const Select_Query query = read_query(call, "FilterQueryLanguage", "FilterQuery");
    Request request = call.request(Operation::ENUMERATE_INSTANCES, {.class_name = query.class_name()});
    return open_and_write(call, std::move(request), new_context(call, Pull_Context::ROWS), &query);
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
    write_objects(call, *context, count);
    const bool more = context->size() != 0;
    if (more)
        call.server.pull_contexts().put_back(name, std::move(context));
    write_end(call, more ? name : std::string());
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
