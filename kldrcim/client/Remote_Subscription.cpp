// What a client puts into a server in order to be told of indications, and takes out again.
#include "kldrcim/client/Remote_Subscription.h"

#include "broker/values/Type_Words.h"
#include "kldrcim/client/Cim_Answer.h"

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

constexpr const char* filter_class = "CIM_IndicationFilter";
constexpr const char* destination_class = "CIM_ListenerDestinationCIMXML";
constexpr const char* subscription_class = "CIM_IndicationSubscription";

/// Gone with the server's end.
constexpr std::uint64_t TRANSIENT = 3;

std::string this_host()
{
    char name[256] = {};
    gethostname(name, sizeof name - 1);
    return name;
}

/// How the names of all that comes from this host begin; the process follows, then a number.
std::string name_prefix()
{
    return "kldrcim:" + this_host() + ":";
}

bool is_orphan(const std::string& name)
{
    const std::string prefix = name_prefix();
    const long process =
        name.starts_with(prefix) ? std::strtol(name.c_str() + prefix.size(), nullptr, 10) : 0;
    return process > 0 && kill(static_cast<pid_t>(process), 0) != 0 && errno == ESRCH;
}

std::string failure_of(const Result& result)
{
    return code_text(result.rc) + (result.message.empty() ? "" : ": " + result.message);
}

} // namespace

Remote_Subscription::Remote_Subscription(const Http_Settings& settings, Indication_Sink sink)
    : _http(settings), _sink(std::move(sink)), _name(name_prefix() + std::to_string(getpid()))
{
}

Remote_Subscription::~Remote_Subscription()
{
    while (!_made.empty()) {
        remove(_made.back());
        _made.pop_back();
    }
}

bool Remote_Subscription::begin(std::string& error)
{
    if (!find_interop(error))
        return false;
    _system_name = system_name();
    take_back_orphans();
    _listener = Indication_Listener::start(_http.own_address(), _sink, error);
    return _listener != nullptr;
}

Result Remote_Subscription::run(const Request& request, Receiver& receiver)
{
    static const No_Catalogue no_classes;
    return ask_for_objects(_http, no_classes, request, receiver);
}

bool Remote_Subscription::find_interop(std::string& error)
{
    for (const char* name : {"interop", "root/interop", "root/PG_InterOp"}) {
        Collected none;
        const Result result = run({.operation = Operation::ENUMERATE_INSTANCE_NAMES,
                                   .path = {.name_space = name, .class_name = filter_class}},
                                  none);
        // Some know no class there, and some refuse the question; only a name space that is not there is
        // wrong.
        if (result.rc == CMPI_RC_ERR_INVALID_NAMESPACE)
            continue;
        _interop = name;
        return true;
    }
    error = _http.settings().url.text() + " has no interop namespace to subscribe in";
    return false;
}

std::string Remote_Subscription::system_name()
{
    Collected managers;
    run({.operation = Operation::ENUMERATE_INSTANCES,
         .path = {.name_space = _interop, .class_name = "CIM_ObjectManager"}},
        managers);
    const Plain_Value* const name =
        managers.instances.empty() ? nullptr : managers.instances.front().property("SystemName");
    return name && !name->as_text().empty() ? name->as_text() : _http.settings().url.host;
}

void Remote_Subscription::take_back_orphans()
{
    const auto name_of = [](const Path_Value* path) {
        const Plain_Value* const name = path ? path->key("Name") : nullptr;
        return name ? name->as_text() : std::string();
    };
    for (const char* class_name : {subscription_class, filter_class, destination_class}) {
        Collected found;
        run({.operation = Operation::ENUMERATE_INSTANCE_NAMES,
             .path = {.name_space = _interop, .class_name = class_name}},
            found);
        for (const Path_Value& path : found.paths) {
            const Plain_Value* const filter = path.key("Filter");
            if (is_orphan(name_of(filter ? filter->as_path() : &path)))
                remove(path);
        }
    }
}

std::optional<Path_Value> Remote_Subscription::create(const std::string& class_name,
                                                      std::vector<Named_Value> properties, std::string& error)
{
    Instance_Value instance;
    instance.path = {.name_space = _interop, .class_name = class_name};
    instance.properties = std::move(properties);
    Collected made;
    const Result result =
        run({.operation = Operation::CREATE_INSTANCE, .path = instance.path, .instance = instance}, made);
    if (!result.ok() || made.paths.empty()) {
        error = failure_of(result) + " (" + class_name + " in " + _interop + ")";
        return std::nullopt;
    }
    _made.push_back(made.paths.front());
    return made.paths.front();
}

std::vector<Named_Value> Remote_Subscription::named(const char* class_name) const
{
    return {{"SystemCreationClassName", Plain_Value::text("CIM_ComputerSystem")},
            {"SystemName", Plain_Value::text(_system_name)},
            {"CreationClassName", Plain_Value::text(class_name)},
            {"Name", Plain_Value::text(_name + ":" + std::to_string(_made.size()))}};
}

bool Remote_Subscription::add(const std::string& indication_class, const std::string& name_space,
                              std::string& error)
{
    std::vector<Named_Value> filter = named(filter_class);
    filter.push_back({"Query", Plain_Value::text("SELECT * FROM " + indication_class)});
    filter.push_back({"QueryLanguage", Plain_Value::text("WQL")});
    filter.push_back({"SourceNamespace", Plain_Value::text(name_space)});
    const auto filter_path = create(filter_class, std::move(filter), error);
    if (!filter_path)
        return false;
    std::vector<Named_Value> destination = named(destination_class);
    destination.push_back({"Destination", Plain_Value::text(_listener->add(name_space))});
    destination.push_back({"PersistenceType", Plain_Value::unsigned_number(CMPI_uint16, TRANSIENT)});
    const auto destination_path = create(destination_class, std::move(destination), error);
    if (!destination_path)
        return false;
    return create(subscription_class,
                  {{"Filter", Plain_Value::path(*filter_path)},
                   {"Handler", Plain_Value::path(*destination_path)}},
                  error)
        .has_value();
}

bool Remote_Subscription::remove(const Path_Value& path)
{
    try {
        Collected none;
        return run({.operation = Operation::DELETE_INSTANCE, .path = path}, none).ok();
    } catch (const Connection_Error&) {
        // The server has gone, and a transient destination with it.
        return false;
    }
}

} // namespace KPRV::kldrcim
