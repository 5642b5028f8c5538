#include "host/Cli.h"

#include "host/Association_Routing.h"
#include "host/Cli_Complaints.h"
#include "host/Cli_Options.h"
#include "host/Cli_Output.h"
#include "host/Cli_Topology.h"
#include "host/Cli_Verbs.h"
#include "host/Host.h"
#include "host/Module_Search.h"
#include "host/Server_Instances_File.h"
#include "host/Typed_Input.h"

#include <dlfcn.h>

namespace KPRV::host {

namespace {

/// Runs one verb on an open module.
class Cli
{
public:
    Cli(const Cli_Options& options, Host& host) : options_(options), host_(host), catalogue_(host.catalogue())
    {
    }

    int run()
    {
        const std::string& verb = options_.verb;
        if (verb == "classes")
            return list_classes();
        if (verb == "tree" || verb == "graph")
            return draw();
        Request request;
        if (!read_request(request))
            return complain(error_, USAGE_ERROR);
        Result result = host_.run(request);
        if (!result.ok())
            return complain(status_text(request, result), 1);
        write(request, result);
        warn_of(result.failures);
        return 0;
    }

private:
    const std::string& argument(std::size_t index) const { return options_.arguments[index]; }

    bool read_request(Request& request)
    {
        static const std::pair<const char*, Operation> verbs[] = {
            {"ei", Operation::ENUMERATE_INSTANCES}, {"ein", Operation::ENUMERATE_INSTANCE_NAMES},
            {"gi", Operation::GET_INSTANCE},        {"ci", Operation::CREATE_INSTANCE},
            {"mi", Operation::MODIFY_INSTANCE},     {"di", Operation::DELETE_INSTANCE},
            {"cm", Operation::INVOKE_METHOD},       {"ai", Operation::ASSOCIATORS},
            {"ain", Operation::ASSOCIATOR_NAMES},   {"ri", Operation::REFERENCES},
            {"rin", Operation::REFERENCE_NAMES},
        };
        for (auto [verb, operation] : verbs)
            if (options_.verb == verb)
                request.operation = operation;
        if (!typed_path(catalogue_, argument(0), request.path, error_))
            return false;
        request.properties = options_.properties;
        if (is_association_operation(request.operation))
            return read_filter(request);
        if (request.properties &&
            !check_properties(catalogue_, request.path.class_name, *request.properties, error_))
            return false;
        switch (request.operation) {
        case Operation::CREATE_INSTANCE:
            return read_new_instance(request);
        case Operation::MODIFY_INSTANCE:
            return read_changes(request);
        case Operation::INVOKE_METHOD:
            request.method = argument(1);
            return read_assignments(request, request.method, 2, request.in);
        default:
            return true;
        }
    }

    /// The instances that come back are of other classes than the path, so that property names stay
    /// unchecked.
    bool read_filter(Request& request)
    {
        request.filter = options_.filter;
        if (request.operation == Operation::REFERENCES || request.operation == Operation::REFERENCE_NAMES)
            std::swap(request.filter.association_class, request.filter.result_class);
        if (request.path.keys.empty())
            error_ = argument(0) + " is a class; " + options_.verb + " wants the path of an instance";
        return !request.path.keys.empty();
    }

    bool read_assignments(const Request& request, const std::string& method, std::size_t from,
                          std::vector<Named_Value>& values)
    {
        for (std::size_t i = from; i < options_.arguments.size(); ++i) {
            Named_Value assignment;
            if (!typed_assignment(catalogue_, request.path.class_name, method, argument(i), assignment,
                                  error_))
                return false;
            set_value(values, assignment.name, std::move(assignment.value));
        }
        return true;
    }

    bool read_new_instance(Request& request)
    {
        Instance_Value& instance = request.instance;
        if (!read_assignments(request, "", 1, instance.properties))
            return false;
        if (const Class_Info* info = catalogue_.find(request.path.class_name))
            for (const Named_Value& property : instance.properties)
                if (info->property(property.name)->key && !property.value.null)
                    set_value(request.path.keys, property.name, property.value);
        instance.path = request.path;
        return true;
    }

    /// Only what is named is modified.
    bool read_changes(Request& request)
    {
        request.instance.path = request.path;
        if (!read_assignments(request, "", 1, request.instance.properties))
            return false;
        request.properties.emplace();
        for (const Named_Value& property : request.instance.properties)
            request.properties->push_back(property.name);
        return true;
    }

    std::string status_text(const Request& request, const Result& result) const
    {
        std::string text = failure_text(result);
        if (result.exception || !result.message.empty())
            return text;
        if (result.rc == CMPI_RC_ERR_INVALID_CLASS)
            text +=
                ": the module has no class " + unknown_class(request) + "; \"kldrcim classes\" lists them";
        else if (result.rc == CMPI_RC_ERR_METHOD_NOT_FOUND)
            text += ": " + request.path.class_name + " has no method " + request.method;
        return text;
    }

    std::string unknown_class(const Request& request) const
    {
        bool named = is_association_operation(request.operation) && !named_association(request).empty();
        return named ? named_association(request) : request.path.class_name;
    }

    int draw()
    {
        std::vector<Provider_Failure> failures;
        if (!write_topology(options_, host_, failures))
            return complain(
                code_text(failures.front().rc) + ": no answer from " + failures.front().provider_class, 1);
        warn_of(failures);
        return 0;
    }

    void write(const Request& request, const Result& result) const
    {
        switch (request.operation) {
        case Operation::ENUMERATE_INSTANCES:
        case Operation::ASSOCIATORS:
        case Operation::REFERENCES:
            return write_instances(options_, result.instances);
        case Operation::GET_INSTANCE:
            return write_instance(options_, result.instances);
        case Operation::INVOKE_METHOD:
            return write_method(options_, result);
        case Operation::ENUMERATE_INSTANCE_NAMES:
        case Operation::CREATE_INSTANCE:
        case Operation::ASSOCIATOR_NAMES:
        case Operation::REFERENCE_NAMES:
            return write_paths(options_, result.paths);
        default:
            return;
        }
    }

    int list_classes() const
    {
        if (!catalogue_.is_known())
            return complain(host_.module().path() + " does not publish its classes", 0);
        write_classes(options_, host_);
        return 0;
    }

    const Cli_Options& options_;
    Host& host_;
    const Class_Catalogue& catalogue_;
    std::string error_;
};

/// Without its adapter library the module loads and finds nothing, which should not look like "no adapters".
void warn_without_adapter_library(const Host& host)
{
    if (host.catalogue().module_name() != "kldrprovider_Module")
        return;
    if (void* library = dlopen("libdzntj.so", RTLD_NOW | RTLD_NOLOAD))
        dlclose(library);
    else
        complain("warning: the adapter library libdzntj.so is not loaded; no adapters will be seen", 0);
}

} // namespace

int run_cli(const std::vector<std::string>& arguments)
{
    Cli_Options options;
    std::string error;
    if (!parse_options(arguments, options, error))
        return complain(error, USAGE_ERROR);
    if (options.help)
        return std::fputs(cli_usage, stdout) < 0;
    if (options.version)
        return std::puts("kldrcim " KLDR_VERSION) < 0;
    Host_Options host_options;
    host_options.user = options.user;
    host_options.name_space = options.name_space;
    auto host = Host::open(options.module.empty() ? default_module() : options.module, host_options, error);
    if (!host)
        return complain("cannot load the provider module: " + error, USAGE_ERROR);
    if (!options.server_instances.empty() &&
        !read_server_instances(options.server_instances, host->catalogue(), host->store(), error))
        return complain(error, USAGE_ERROR);
    warn_without_adapter_library(*host);
    const Verb_Body body = find_verb(options.verb)->body;
    int status = body ? body(options, *host) : Cli(options, *host).run();
    for (const std::string& violation : host->violations().list())
        complain("warning: the provider broke the CMPI contract: " + violation, 0);
    if (options.leaks)
        host->ledger().report(stderr);
    return status;
}

} // namespace KPRV::host
