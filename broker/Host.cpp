#include "broker/Host.h"

#include "broker/Association_Routing.h"
#include "broker/Registration_Catalogue.h"

namespace KPRV::broker {

std::unique_ptr<Host> Host::open(const std::string& library, Host_Options options, std::string& error)
{
    std::unique_ptr<Module> module = Module::open(library, error);
    if (!module)
        return nullptr;
    return std::unique_ptr<Host>(new Host(std::move(module), std::move(options)));
}

Host::Host(std::unique_ptr<Module> module, Host_Options options)
    : core_(std::make_shared<Core>(std::move(options))), module_(std::move(module))
{
    if (const Registration* head = module_->registrations())
        catalogue_ = std::make_unique<Registration_Catalogue>(head);
    else
        catalogue_ = std::make_unique<No_Catalogue>();
    core_->catalogue = catalogue_.get();
    broker_ = std::make_unique<Broker>(core_, static_cast<Up_Calls&>(*this));
    providers_ = std::make_unique<Provider_Set>(*module_, *broker_);
}

Host::~Host()
{
    providers_->cleanup(true);
}

CMPIrc Host::unload(const std::string& class_name, bool terminating)
{
    return providers_->cleanup(class_name, terminating);
}

void Host::add_context(Request& request) const
{
    const Host_Options& options = core_->options;
    auto add = [&](const char* name, Value value) {
        if (!find_value(request.context, name))
            request.context.push_back({name, std::move(value)});
    };
    add(CMPIInvocationFlags, Value::unsigned_number(CMPI_uint32, 0));
    add(CMPIInitNameSpace, Value::text(request.path.name_space));
    if (options.user || options.user_without_text)
        add(CMPIPrincipal, Value::text(options.user.value_or("")));
}

bool Host::is_known_class(const std::string& class_name) const
{
    if (catalogue_->find(class_name))
        return true;
    for (Mi_Kind kind : mi_kinds)
        if (providers_->serves(class_name, kind))
            return true;
    return false;
}

/// An association may start at an object that is none of the module's, if its class is named.
bool Host::may_be_asked(const Request& request) const
{
    bool named = is_association_operation(request.operation) && !named_association(request).empty();
    return named || is_known_class(request.path.class_name);
}

std::vector<std::string> Host::classes_that_serve(const Request& request) const
{
    Mi_Kind kind = request.operation == Operation::INVOKE_METHOD ? Mi_Kind::METHOD : Mi_Kind::INSTANCE;
    // The spelling of the schema, which is that of the factories.
    const Class_Info* info = catalogue_->find(request.path.class_name);
    const std::string& class_name = info ? info->name : request.path.class_name;
    std::vector<std::string> classes;
    if (!class_name.empty() && providers_->serves(class_name, kind))
        classes.push_back(class_name);
    bool enumerates = request.operation == Operation::ENUMERATE_INSTANCES ||
                      request.operation == Operation::ENUMERATE_INSTANCE_NAMES;
    if (!info || !enumerates)
        return classes;
    for (const std::string& name : catalogue_->class_names())
        if (name != class_name && catalogue_->is_a(name, class_name) && providers_->serves(name, kind))
            classes.push_back(name);
    return classes;
}

Result Host::route(const Request& request, Receiver* receiver)
{
    Result result;
    std::vector<std::string> classes = classes_that_serve(request);
    if (classes.empty())
        result.rc = CMPI_RC_ERR_NOT_SUPPORTED;
    for (const std::string& class_name : classes) {
        Result one = call_provider(*broker_, *providers_, class_name, request, receiver);
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

Result Host::traverse(const Request& request, Receiver* receiver)
{
    Association_Merge merge(receiver);
    bool asked = false;
    for (const std::string& class_name : association_classes(*catalogue_, request))
        if (!merge.is_stopped() && providers_->serves(class_name, Mi_Kind::ASSOCIATION)) {
            merge.add(class_name, call_provider(*broker_, *providers_, class_name, request, merge.taker()));
            asked = true;
        }
    Result result = merge.settle();
    const std::string& named = named_association(request);
    if (asked || (named.empty() && catalogue_->is_known()))
        return result;
    bool unknown = catalogue_->is_known() && !catalogue_->find(named);
    result.rc = unknown ? CMPI_RC_ERR_INVALID_CLASS : CMPI_RC_ERR_NOT_SUPPORTED;
    return result;
}

Result Host::run(Request request, Receiver* receiver)
{
    if (request.path.name_space.empty())
        request.path.name_space = core_->options.name_space;
    add_context(request);
    if (!may_be_asked(request)) {
        Result result;
        result.rc = CMPI_RC_ERR_INVALID_CLASS;
        return result;
    }
    return is_association_operation(request.operation) ? traverse(request, receiver)
                                                       : route(request, receiver);
}

Result Host::run_at(const std::string& provider_class, Request request, Receiver* receiver)
{
    if (request.path.name_space.empty())
        request.path.name_space = core_->options.name_space;
    add_context(request);
    return call_provider(*broker_, *providers_, provider_class, request, receiver);
}

Result Host::up_call(const Request& request)
{
    if (store_.serves(*catalogue_, request.path))
        return store_.run(*catalogue_, request);
    Result result;
    bool own = same_name(request.path.name_space, core_->options.name_space);
    if (own && may_be_asked(request))
        return is_association_operation(request.operation) ? traverse(request) : route(request);
    bool known = own || store_.has_name_space(request.path.name_space);
    result.rc = known ? core_->options.unknown_class_rc : core_->options.unknown_name_space_rc;
    return result;
}

Result Host::associators(const std::string& provider_class, const Path_Value& path,
                         const Association_Filter& filter, const Property_List& properties)
{
    return run_at(
        provider_class,
        {.operation = Operation::ASSOCIATORS, .path = path, .properties = properties, .filter = filter});
}

Result Host::associator_names(const std::string& provider_class, const Path_Value& path,
                              const Association_Filter& filter)
{
    return run_at(provider_class, {.operation = Operation::ASSOCIATOR_NAMES, .path = path, .filter = filter});
}

Result Host::references(const std::string& provider_class, const Path_Value& path,
                        const Association_Filter& filter, const Property_List& properties)
{
    return run_at(
        provider_class,
        {.operation = Operation::REFERENCES, .path = path, .properties = properties, .filter = filter});
}

Result Host::reference_names(const std::string& provider_class, const Path_Value& path,
                             const Association_Filter& filter)
{
    return run_at(provider_class, {.operation = Operation::REFERENCE_NAMES, .path = path, .filter = filter});
}

} // namespace KPRV::broker
