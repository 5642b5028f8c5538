#include "kldrcim/verbs/Cli_Operations.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Typed_Input.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Output.h"
#include "kldrcim/verbs/Cli_Verbs.h"
#include "kldrcim/verbs/Result_Filter.h"

namespace KPRV::kldrcim {

namespace {

/// One of the plain operations, from the words of the command line.
class Plain_Operation
{
public:
    Plain_Operation(const Cli_Options& options, Connection& connection)
        : _options(options), _connection(connection), _catalogue(connection.classes())
    {
    }

    int run()
    {
        Request request;
        request.operation = find_verb(_options.verb)->operation;
        if (!read_request(request))
            return complain(_error, USAGE_ERROR);
        std::optional<Result_Filter> filter;
        if (answers_with_many(request.operation))
            filter.emplace(_options, make_writer(_options));
        const Result result = _connection.run(request, filter ? &*filter : nullptr);
        // What came before a failure is worth reading; that it is not all is told behind it.
        if (filter)
            filter->end(result.ok());
        if (!result.ok()) {
            flush_output();
            return complain(status_text(request, result), FAILURE);
        }
        write(request, result);
        warn_of(result.failures);
        const std::string missed = filter ? filter->missed_name(_catalogue) : "";
        if (missed.empty())
            return 0;
        flush_output();
        return complain("no result has a " + std::string(brings_names(request) ? "key" : "property") + " \"" +
                            missed + "\"",
                        USAGE_ERROR);
    }

private:
    const std::string& argument(std::size_t index) const { return _options.arguments[index]; }

    bool read_request(Request& request)
    {
        if (!typed_path(_catalogue, argument(0), request.path, _error) ||
            (!request.path.name_space.empty() && !_connection.serves(request.path.name_space, _error)))
            return false;
        request.properties = properties_for(_options);
        if (is_association_operation(request.operation))
            return read_filter(request);
        if ((request.properties &&
             !check_properties(_catalogue, request.path.class_name, *request.properties, _error)) ||
            !check_filter(_options, _catalogue, request.path.class_name, brings_names(request), _error))
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

    static bool brings_names(const Request& request)
    {
        return request.operation == Operation::ENUMERATE_INSTANCE_NAMES ||
               request.operation == Operation::ASSOCIATOR_NAMES ||
               request.operation == Operation::REFERENCE_NAMES;
    }

    /// The instances that come back are of other classes than the path, so that property names stay
    /// unchecked.
    bool read_filter(Request& request)
    {
        request.filter = _options.filter;
        if (request.operation == Operation::REFERENCES || request.operation == Operation::REFERENCE_NAMES)
            std::swap(request.filter.association_class, request.filter.result_class);
        if (request.path.keys.empty())
            _error = argument(0) + " is a class; " + _options.verb + " wants the path of an instance";
        return !request.path.keys.empty();
    }

    bool read_assignments(const Request& request, const std::string& method, std::size_t from,
                          std::vector<Named_Value>& values)
    {
        for (std::size_t i = from; i < _options.arguments.size(); ++i) {
            Named_Value assignment;
            if (!typed_assignment(_catalogue, request.path.class_name, method, argument(i), assignment,
                                  _error))
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
        if (const Class_Info* info = _catalogue.find(request.path.class_name))
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
            text += ": " + _connection.subject() + " has no class " + unknown_class(request) +
                    "; \"kldrcim classes\" lists them";
        else if (result.rc == CMPI_RC_ERR_INVALID_NAMESPACE)
            text += ": " + _connection.subject() + " has no namespace " +
                    (request.path.name_space.empty() ? _options.name_space : request.path.name_space);
        else if (result.rc == CMPI_RC_ERR_METHOD_NOT_FOUND)
            text += ": " + request.path.class_name + " has no method " + request.method;
        return text;
    }

    std::string unknown_class(const Request& request) const
    {
        bool named = is_association_operation(request.operation) && !named_association(request).empty();
        return named ? named_association(request) : request.path.class_name;
    }

    static bool answers_with_many(Operation operation)
    {
        return is_association_operation(operation) || operation == Operation::ENUMERATE_INSTANCES ||
               operation == Operation::ENUMERATE_INSTANCE_NAMES;
    }

    void write(const Request& request, const Result& result) const
    {
        if (request.operation == Operation::GET_INSTANCE)
            write_instance(_options, result.instances);
        else if (request.operation == Operation::INVOKE_METHOD)
            write_method(_options, request, result);
        else if (request.operation == Operation::CREATE_INSTANCE)
            write_paths(result.paths);
    }

    /// Of what was created.
    void write_paths(const std::vector<Path_Value>& paths) const
    {
        const auto writer = make_writer(_options);
        for (const Path_Value& path : paths)
            writer->path(Path_Value(path));
        writer->end(true);
    }

    const Cli_Options& _options;
    Connection& _connection;
    const Class_Catalogue& _catalogue;
    std::string _error;
};

} // namespace

int run_operation(const Cli_Options& options, Connection& connection)
{
    return Plain_Operation(options, connection).run();
}

} // namespace KPRV::kldrcim
