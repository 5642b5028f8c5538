#include "broker/Mi_Call.h"

#include "broker/Convert.h"
#include "broker/values/Type_Words.h"

namespace KPRV::broker {

Mi_Frame::Mi_Frame(Broker& broker, const std::vector<Named_Value>& entries)
    : _broker(broker), _context(*broker.core(), entries, broker.core()->options.user_without_text),
      _frame(broker.core(), _context.cmpi())
{
}

void Mi_Frame::read_status(const CMPIStatus& status, Result& result)
{
    result.rc = status.rc;
    if (!status.msg)
        return;
    if (Object* object = find_object(status.msg);
        object && object->live && object->kind == Object_Kind::STRING)
        result.message = static_cast<String_Object*>(object)->text();
    else
        core().violations.add("CMPIStatus", "the message is not a live string");
}

void Mi_Frame::caught(Result& result, const char* what)
{
    result.rc = CMPI_RC_ERR_FAILED;
    result.exception = what;
    core().violations.add("MI entry", std::string("an exception left the provider: ") + what);
}

namespace {

/// A property list as the entries take it.
class C_List
{
public:
    explicit C_List(const Property_List& list)
    {
        if (!list)
            return;
        for (const std::string& name : *list)
            _names.push_back(name.c_str());
        _names.push_back(nullptr);
    }
    const char** get() { return _names.empty() ? nullptr : _names.data(); }

private:
    std::vector<const char*> _names;
};

/// Empty filters are passed as null.
const char* or_null(const std::string& text)
{
    return text.empty() ? nullptr : text.c_str();
}

unsigned accepted_by(Operation operation)
{
    switch (operation) {
    case Operation::ENUMERATE_INSTANCES:
    case Operation::GET_INSTANCE:
    case Operation::ASSOCIATORS:
    case Operation::REFERENCES:
        return Result_Object::INSTANCES;
    case Operation::INVOKE_METHOD:
        return Result_Object::DATA;
    case Operation::DELETE_INSTANCE:
        return 0;
    default:
        // A path from modifyInstance is needless, but servers live with it.
        return Result_Object::PATHS;
    }
}

/// One request on its way through one provider.
class Provider_Call final : private Receiver
{
public:
    Provider_Call(Broker& broker, Provider_Set& providers, const std::string& class_name,
                  const Request& request, Receiver* receiver)
        : _providers(providers), _class_name(class_name), _request(request),
          _receiver(receiver ? *receiver : _kept), _frame(broker, request.context),
          _path(_frame.core(), path_of(class_name, request), request.from_client),
          _results(_frame.core(), accepted_by(request.operation), static_cast<Receiver&>(*this)),
          _list(request.properties)
    {
    }

    Result run()
    {
        switch (_request.operation) {
        case Operation::INVOKE_METHOD:
            invoke();
            break;
        case Operation::ASSOCIATORS:
        case Operation::ASSOCIATOR_NAMES:
        case Operation::REFERENCES:
        case Operation::REFERENCE_NAMES:
            traverse();
            break;
        default:
            operate();
        }
        collect();
        return std::move(_result);
    }

private:
    Core& core() { return _frame.core(); }
    void violation(const std::string& what) { core().violations.add(_class_name.c_str(), what); }

    /// An enumeration of a superclass reaches each provider under its own class.
    static Path_Value path_of(const std::string& class_name, const Request& request)
    {
        Path_Value path = request.path;
        if (request.operation == Operation::ENUMERATE_INSTANCES ||
            request.operation == Operation::ENUMERATE_INSTANCE_NAMES)
            path.class_name = class_name;
        return path;
    }

    template <class Mi, class Entry, class... Arguments>
    void call(Mi* mi, Entry entry, Arguments... arguments)
    {
        if (!mi || !(mi->ft->*entry)) {
            if (_result.ok())
                _result.rc = CMPI_RC_ERR_NOT_SUPPORTED;
            return;
        }
        _frame.run(_result, [&] {
            return (mi->ft->*entry)(mi, _frame.context(), _results.cmpi(), _path.cmpi(), arguments...);
        });
    }

    void operate()
    {
        using Table = CMPIInstanceMIFT;
        CMPIInstanceMI* mi = _providers.instance(_class_name, _result);
        switch (_request.operation) {
        case Operation::ENUMERATE_INSTANCE_NAMES:
            return call(mi, &Table::enumerateInstanceNames);
        case Operation::ENUMERATE_INSTANCES:
            return call(mi, &Table::enumerateInstances, _list.get());
        case Operation::GET_INSTANCE:
            return call(mi, &Table::getInstance, _list.get());
        case Operation::DELETE_INSTANCE:
            return call(mi, &Table::deleteInstance);
        default:
            break;
        }
        Argument<Instance_Object> instance(core(), complete(_request.instance));
        if (_request.operation == Operation::CREATE_INSTANCE)
            call(mi, &Table::createInstance, static_cast<const CMPIInstance*>(instance.cmpi()));
        else
            call(mi, &Table::modifyInstance, static_cast<const CMPIInstance*>(instance.cmpi()), _list.get());
    }

    /// Servers add the keys of the path, and the class's other properties with default or null.
    Instance_Value complete(Instance_Value instance)
    {
        const Class_Info* info = core().catalogue->find(instance.path.class_name);
        if (!info)
            return instance;
        for (const Feature_Info& feature : info->properties) {
            if (instance.property(feature.name))
                continue;
            const Plain_Value* key = feature.key ? instance.path.key(feature.name) : nullptr;
            if (!key)
                instance.properties.push_back({feature.name, feature.default_value});
            else if (is_integer(key->type) && is_integer(feature.type))
                instance.properties.push_back({feature.name, with_integer_type(*key, feature.type)});
            else
                instance.properties.push_back({feature.name, *key});
        }
        return instance;
    }

    void traverse()
    {
        using Table = CMPIAssociationMIFT;
        CMPIAssociationMI* mi = _providers.association(_class_name, _result);
        const Association_Filter& filter = _request.filter;
        const char *association_class = or_null(filter.association_class),
                   *result_class = or_null(filter.result_class), *role = or_null(filter.role),
                   *result_role = or_null(filter.result_role);
        switch (_request.operation) {
        case Operation::ASSOCIATORS:
            return call(mi, &Table::associators, association_class, result_class, role, result_role,
                        _list.get());
        case Operation::ASSOCIATOR_NAMES:
            return call(mi, &Table::associatorNames, association_class, result_class, role, result_role);
        case Operation::REFERENCES:
            return call(mi, &Table::references, result_class, role, _list.get());
        default:
            return call(mi, &Table::referenceNames, result_class, role);
        }
    }

    void invoke()
    {
        Argument<Args_Object> in(core(), arguments());
        Argument<Args_Object> out(core());
        call(_providers.method(_class_name, _result), &CMPIMethodMIFT::invokeMethod, _request.method.c_str(),
             static_cast<const CMPIArgs*>(in.cmpi()), out.cmpi());
        _result.out = out->content;
        if (!_result.ok())
            return;
        if (_results->data.size() == 1)
            _result.return_value = _results->data.front();
        else
            violation("a method returns one value, not " + std::to_string(_results->data.size()));
        check_out();
    }

    std::vector<Named_Value> arguments()
    {
        std::vector<Named_Value> given = _request.in;
        if (core().options.argument_style == Server_Options::Argument_Style::LEFT_OUT)
            std::erase_if(given, [](const Named_Value& argument) { return argument.value.null; });
        for (Named_Value& argument : given)
            if (argument.value.null)
                argument.value = Plain_Value::null_of(CMPI_boolean);
        return given;
    }

    void check_out()
    {
        const Class_Info* info = core().catalogue->find(_request.path.class_name);
        const Method_Info* method = info ? info->method(_request.method) : nullptr;
        if (!method)
            return;
        for (const Named_Value& argument : _result.out) {
            const Feature_Info* parameter = method->parameter(argument.name);
            if (!parameter || !parameter->out)
                violation(_request.method + " has no out parameter " + argument.name);
            else if (parameter->type != argument.value.type)
                violation(_request.method + "." + argument.name + " is " + type_word_name(parameter->type) +
                          ", not " + type_word_name(argument.value.type));
        }
    }

    void collect()
    {
        if (_failure)
            std::rethrow_exception(_failure);
        _result.instances = std::move(_kept.instances);
        _result.paths = std::move(_kept.paths);
        _result.done_count = _results->done_count;
        _result.done = _result.done_count > 0;
        _result.stopped = _results->stopped;
        if (_result.ok() && _request.operation == Operation::GET_INSTANCE && _returned != 1)
            violation("getInstance answers one instance, not " + std::to_string(_returned));
        if (_result.ok() && _request.operation == Operation::CREATE_INSTANCE && _returned != 1)
            violation("createInstance answers one path, not " + std::to_string(_returned));
    }

    bool instance(Instance_Value&& instance) override
    {
        // Properties outside the list are the server's to filter, should the provider have set them all the
        // same.
        if (_request.properties)
            std::erase_if(instance.properties, [&](const Named_Value& property) {
                return !contains_name(*_request.properties, property.name);
            });
        return take(std::move(instance), &Receiver::instance);
    }

    bool path(Path_Value&& path) override { return take(std::move(path), &Receiver::path); }

    /// What a receiver throws is none of the provider's business, and must not unwind it.
    template <class Object>
    bool take(Object&& object, bool (Receiver::*receive)(Object&&))
    {
        ++_returned;
        try {
            return (_receiver.*receive)(std::forward<Object>(object));
        } catch (...) {
            _failure = std::current_exception();
            return false;
        }
    }

    Provider_Set& _providers;
    const std::string& _class_name;
    const Request& _request;
    Collected _kept;
    Receiver& _receiver;
    std::exception_ptr _failure;
    std::size_t _returned = 0;
    Mi_Frame _frame;
    Argument<Path_Object> _path;
    Argument<Result_Object> _results;
    C_List _list;
    Result _result;
};

} // namespace

Result call_provider(Broker& broker, Provider_Set& providers, const std::string& class_name,
                     const Request& request, Receiver* receiver)
{
    return Provider_Call(broker, providers, class_name, request, receiver).run();
}

} // namespace KPRV::broker
