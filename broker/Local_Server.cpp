#include "broker/Local_Server.h"

#include "broker/Association_Routing.h"
#include "broker/Registration_Catalogue.h"

namespace KPRV::broker {

std::unique_ptr<Local_Server> Local_Server::open(const std::string& library, Server_Options options,
                                                 std::string& error)
{
    std::unique_ptr<Module> module = Module::open(library, error);
    if (!module)
        return nullptr;
    return std::unique_ptr<Local_Server>(new Local_Server(std::move(module), std::move(options)));
}

Local_Server::Local_Server(std::unique_ptr<Module> module, Server_Options options)
    : _core(std::make_shared<Core>(std::move(options))), _module(std::move(module))
{
    if (const Registration* head = _module->registrations())
        _catalogue = std::make_unique<Registration_Catalogue>(head);
    else
        _catalogue = std::make_unique<No_Catalogue>();
    _core->catalogue = _catalogue.get();
    _broker = std::make_unique<Broker>(_core, static_cast<Up_Calls&>(*this));
    _providers = std::make_unique<Provider_Set>(*_module, *_broker);
}

Local_Server::~Local_Server()
{
    _providers->cleanup(true);
}

CMPIrc Local_Server::unload(const std::string& class_name, bool terminating)
{
    return _providers->cleanup(class_name, terminating);
}

void Local_Server::add_context(Request& request) const
{
    const Server_Options& options = _core->options;
    auto add = [&](const char* name, Plain_Value value) {
        if (!find_value(request.context, name))
            request.context.push_back({name, std::move(value)});
    };
    add(CMPIInvocationFlags, Plain_Value::unsigned_number(CMPI_uint32, 0));
    add(CMPIInitNameSpace, Plain_Value::text(request.path.name_space));
    if (options.user || options.user_without_text)
        add(CMPIPrincipal, Plain_Value::text(options.user.value_or("")));
}

bool Local_Server::is_known_class(const std::string& class_name) const
{
    if (_catalogue->find(class_name))
        return true;
    for (Mi_Kind kind : mi_kinds)
        if (_providers->serves(class_name, kind))
            return true;
    return false;
}

/// An association may start at an object that is none of the module's, if its class is named.
bool Local_Server::may_be_asked(const Request& request) const
{
    bool named = is_association_operation(request.operation) && !named_association(request).empty();
    return named || is_known_class(request.path.class_name);
}

std::vector<std::string> Local_Server::classes_that_serve(const Request& request) const
{
    Mi_Kind kind = request.operation == Operation::INVOKE_METHOD ? Mi_Kind::METHOD : Mi_Kind::INSTANCE;
    // The spelling of the schema, which is that of the factories.
    const Class_Info* info = _catalogue->find(request.path.class_name);
    const std::string& class_name = info ? info->name : request.path.class_name;
    std::vector<std::string> classes;
    if (!class_name.empty() && _providers->serves(class_name, kind))
        classes.push_back(class_name);
    bool enumerates = request.operation == Operation::ENUMERATE_INSTANCES ||
                      request.operation == Operation::ENUMERATE_INSTANCE_NAMES;
    if (!info || !enumerates)
        return classes;
    for (const std::string& name : _catalogue->class_names())
        if (name != class_name && _catalogue->is_a(name, class_name) && _providers->serves(name, kind))
            classes.push_back(name);
    return classes;
}

Result Local_Server::route(const Request& request, Receiver* receiver)
{
    Result result;
    std::vector<std::string> classes = classes_that_serve(request);
    if (classes.empty())
        result.rc = CMPI_RC_ERR_NOT_SUPPORTED;
    for (const std::string& class_name : classes) {
        Result one = call_provider(*_broker, *_providers, class_name, request, receiver);
        one.done_count += result.done_count;
        one.done = one.done_count > 0;
        one.instances.insert(one.instances.begin(), std::make_move_iterator(result.instances.begin()),
                             std::make_move_iterator(result.instances.end()));
        one.paths.insert(one.paths.begin(), std::make_move_iterator(result.paths.begin()),
                         std::make_move_iterator(result.paths.end()));
        result = std::move(one);
        if (!result.ok() || result.stopped)
            break;
    }
    return result;
}

Result Local_Server::traverse(const Request& request, Receiver* receiver)
{
    Association_Merge merge(receiver);
    bool asked = false;
    for (const std::string& class_name : association_classes(*_catalogue, request))
        if (!merge.is_stopped() && _providers->serves(class_name, Mi_Kind::ASSOCIATION)) {
            merge.add(class_name, call_provider(*_broker, *_providers, class_name, request, merge.taker()));
            asked = true;
        }
    Result result = merge.settle();
    const std::string& named = named_association(request);
    if (asked || (named.empty() && _catalogue->is_known()))
        return result;
    bool unknown = _catalogue->is_known() && !_catalogue->find(named);
    result.rc = unknown ? CMPI_RC_ERR_INVALID_CLASS : CMPI_RC_ERR_NOT_SUPPORTED;
    return result;
}

Result Local_Server::run(Request request, Receiver* receiver)
{
    if (request.path.name_space.empty())
        request.path.name_space = _core->options.name_space;
    add_context(request);
    if (!may_be_asked(request)) {
        Result result;
        result.rc = CMPI_RC_ERR_INVALID_CLASS;
        return result;
    }
    return is_association_operation(request.operation) ? traverse(request, receiver)
                                                       : route(request, receiver);
}

Result Local_Server::run_at(const std::string& provider_class, Request request, Receiver* receiver)
{
    if (request.path.name_space.empty())
        request.path.name_space = _core->options.name_space;
    add_context(request);
    return call_provider(*_broker, *_providers, provider_class, request, receiver);
}

Result Local_Server::up_call(const Request& request)
{
    if (_store.serves(*_catalogue, request.path))
        return _store.run(*_catalogue, request);
    Result result;
    bool own = same_name(request.path.name_space, _core->options.name_space);
    if (own && may_be_asked(request))
        return is_association_operation(request.operation) ? traverse(request) : route(request);
    bool known = own || _store.has_name_space(request.path.name_space);
    result.rc = known ? _core->options.unknown_class_rc : _core->options.unknown_name_space_rc;
    return result;
}

Result Local_Server::associators(const std::string& provider_class, const Path_Value& path,
                                 const Association_Filter& filter, const Property_List& properties)
{
    return run_at(
        provider_class,
        {.operation = Operation::ASSOCIATORS, .path = path, .properties = properties, .filter = filter});
}

Result Local_Server::associator_names(const std::string& provider_class, const Path_Value& path,
                                      const Association_Filter& filter)
{
    return run_at(provider_class, {.operation = Operation::ASSOCIATOR_NAMES, .path = path, .filter = filter});
}

Result Local_Server::references(const std::string& provider_class, const Path_Value& path,
                                const Association_Filter& filter, const Property_List& properties)
{
    return run_at(
        provider_class,
        {.operation = Operation::REFERENCES, .path = path, .properties = properties, .filter = filter});
}

Result Local_Server::reference_names(const std::string& provider_class, const Path_Value& path,
                                     const Association_Filter& filter)
{
    return run_at(provider_class, {.operation = Operation::REFERENCE_NAMES, .path = path, .filter = filter});
}

} // namespace KPRV::broker
