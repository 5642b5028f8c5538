#include "broker/Mi_Call.h"

#include "broker/Convert.h"
#include "broker/values/Type_Words.h"

namespace KPRV::broker {

Mi_Frame::Mi_Frame(Broker& broker, const std::vector<Named_Value>& entries)
    : broker_(broker), context_(*broker.core(), entries, broker.core()->options.user_without_text),
      frame_(broker.core(), context_.cmpi())
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
            names_.push_back(name.c_str());
        names_.push_back(nullptr);
    }
    const char** get() { return names_.empty() ? nullptr : names_.data(); }

private:
    std::vector<const char*> names_;
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
        : providers_(providers), class_name_(class_name), request_(request),
          receiver_(receiver ? *receiver : kept_), frame_(broker, request.context),
          path_(frame_.core(), path_of(class_name, request), request.from_client),
          results_(frame_.core(), accepted_by(request.operation), static_cast<Receiver&>(*this)),
          list_(request.properties)
    {
    }

    Result run()
    {
        switch (request_.operation) {
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
        return std::move(result_);
    }

private:
    Core& core() { return frame_.core(); }
    void violation(const std::string& what) { core().violations.add(class_name_.c_str(), what); }

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
            if (result_.ok())
                result_.rc = CMPI_RC_ERR_NOT_SUPPORTED;
            return;
        }
        frame_.run(result_, [&] {
            return (mi->ft->*entry)(mi, frame_.context(), results_.cmpi(), path_.cmpi(), arguments...);
        });
    }

    void operate()
    {
        using Table = CMPIInstanceMIFT;
        CMPIInstanceMI* mi = providers_.instance(class_name_, result_);
        switch (request_.operation) {
        case Operation::ENUMERATE_INSTANCE_NAMES:
            return call(mi, &Table::enumerateInstanceNames);
        case Operation::ENUMERATE_INSTANCES:
            return call(mi, &Table::enumerateInstances, list_.get());
        case Operation::GET_INSTANCE:
            return call(mi, &Table::getInstance, list_.get());
        case Operation::DELETE_INSTANCE:
            return call(mi, &Table::deleteInstance);
        default:
            break;
        }
        Argument<Instance_Object> instance(core(), complete(request_.instance));
        if (request_.operation == Operation::CREATE_INSTANCE)
            call(mi, &Table::createInstance, static_cast<const CMPIInstance*>(instance.cmpi()));
        else
            call(mi, &Table::modifyInstance, static_cast<const CMPIInstance*>(instance.cmpi()), list_.get());
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
            const Value* key = feature.key ? instance.path.key(feature.name) : nullptr;
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
        CMPIAssociationMI* mi = providers_.association(class_name_, result_);
        const Association_Filter& filter = request_.filter;
        const char *association_class = or_null(filter.association_class),
                   *result_class = or_null(filter.result_class), *role = or_null(filter.role),
                   *result_role = or_null(filter.result_role);
        switch (request_.operation) {
        case Operation::ASSOCIATORS:
            return call(mi, &Table::associators, association_class, result_class, role, result_role,
                        list_.get());
        case Operation::ASSOCIATOR_NAMES:
            return call(mi, &Table::associatorNames, association_class, result_class, role, result_role);
        case Operation::REFERENCES:
            return call(mi, &Table::references, result_class, role, list_.get());
        default:
            return call(mi, &Table::referenceNames, result_class, role);
        }
    }

    void invoke()
    {
        Argument<Args_Object> in(core(), arguments());
        Argument<Args_Object> out(core());
        call(providers_.method(class_name_, result_), &CMPIMethodMIFT::invokeMethod, request_.method.c_str(),
             static_cast<const CMPIArgs*>(in.cmpi()), out.cmpi());
        result_.out = out->content;
        if (!result_.ok())
            return;
        if (results_->data.size() == 1)
            result_.return_value = results_->data.front();
        else
            violation("a method returns one value, not " + std::to_string(results_->data.size()));
        check_out();
    }

    std::vector<Named_Value> arguments()
    {
        std::vector<Named_Value> given = request_.in;
        if (core().options.argument_style == Host_Options::Argument_Style::LEFT_OUT)
            std::erase_if(given, [](const Named_Value& argument) { return argument.value.null; });
        for (Named_Value& argument : given)
            if (argument.value.null)
                argument.value = Value::null_of(CMPI_boolean);
        return given;
    }

    void check_out()
    {
        const Class_Info* info = core().catalogue->find(request_.path.class_name);
        const Method_Info* method = info ? info->method(request_.method) : nullptr;
        if (!method)
            return;
        for (const Named_Value& argument : result_.out) {
            const Feature_Info* parameter = method->parameter(argument.name);
            if (!parameter || !parameter->out)
                violation(request_.method + " has no out parameter " + argument.name);
            else if (parameter->type != argument.value.type)
                violation(request_.method + "." + argument.name + " is " + type_word_name(parameter->type) +
                          ", not " + type_word_name(argument.value.type));
        }
    }

    void collect()
    {
        if (failure_)
            std::rethrow_exception(failure_);
        result_.instances = std::move(kept_.instances);
        result_.paths = std::move(kept_.paths);
        result_.done_count = results_->done_count;
        result_.done = result_.done_count > 0;
        result_.stopped = results_->stopped;
        if (result_.ok() && request_.operation == Operation::GET_INSTANCE && returned_ != 1)
            violation("getInstance answers one instance, not " + std::to_string(returned_));
        if (result_.ok() && request_.operation == Operation::CREATE_INSTANCE && returned_ != 1)
            violation("createInstance answers one path, not " + std::to_string(returned_));
    }

    bool instance(Instance_Value&& instance) override
    {
        // Properties outside the list are the server's to filter, should the provider have set them all the
        // same.
        if (request_.properties)
            std::erase_if(instance.properties, [&](const Named_Value& property) {
                return !contains_name(*request_.properties, property.name);
            });
        return take(std::move(instance), &Receiver::instance);
    }

    bool path(Path_Value&& path) override { return take(std::move(path), &Receiver::path); }

    /// What a receiver throws is none of the provider's business, and must not unwind it.
    template <class Object>
    bool take(Object&& object, bool (Receiver::*receive)(Object&&))
    {
        ++returned_;
        try {
            return (receiver_.*receive)(std::forward<Object>(object));
        } catch (...) {
            failure_ = std::current_exception();
            return false;
        }
    }

    Provider_Set& providers_;
    const std::string& class_name_;
    const Request& request_;
    Collected kept_;
    Receiver& receiver_;
    std::exception_ptr failure_;
    std::size_t returned_ = 0;
    Mi_Frame frame_;
    Argument<Path_Object> path_;
    Argument<Result_Object> results_;
    C_List list_;
    Result result_;
};

} // namespace

Result call_provider(Broker& broker, Provider_Set& providers, const std::string& class_name,
                     const Request& request, Receiver* receiver)
{
    return Provider_Call(broker, providers, class_name, request, receiver).run();
}

} // namespace KPRV::broker
