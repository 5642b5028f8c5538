#pragma once

#include "module/runtime/dispatch/Provider_Dispatch.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <functional>
#include <string>
#include <vector>

namespace KPRV {

/// What the scripted providers answer, and a note of each call in order. One for all of them; tests reset it.
struct Script
{
    using Deliver = std::function<bool(Instance*)>;

    std::vector<std::string> calls;

    // Operations without a function answer as a provider that does not implement them.
    std::function<int()> construct;
    std::function<int()> load;
    std::function<int()> unload;
    std::function<int(const Instance* model, Instance*& instance)> get_instance;
    std::function<int(const Instance* model, const Deliver& deliver)> enum_instances;
    std::function<int(Instance* instance)> create_instance;
    std::function<int(const Instance* instance)> delete_instance;
    std::function<int(const Instance* model, const Instance* instance)> modify_instance;
    std::function<int(const Instance* self, Instance* method)> invoke;
    /// The filters come joined as "result class|role|result role".
    std::function<int(const Instance* instance, const std::string& filters, const Deliver& deliver)>
        enum_associator_names;
    std::function<int(const Instance* instance, const std::string& filters, const Deliver& deliver)>
        enum_associators;
    std::function<int(const Instance* instance, const Instance* model, const std::string& role,
                      const Deliver& deliver)>
        enum_references;
    std::function<int(const Deliver& deliver)> enable_indications;
    std::function<int()> disable_indications;
};

inline Script script;

/// A provider of a sample class that does what the script says.
template <class T, Provider_Kind KIND>
class Scripted_Provider
{
public:
    using Class = T;
    static constexpr Provider_Kind kind = KIND;
    static constexpr bool has_methods = true;

    Scripted_Provider() { answer("construct", script.construct, 0); }
    ~Scripted_Provider() { script.calls.push_back("destroy"); }

    int load() { return answer("load", script.load, 0); }
    int unload() { return answer("unload", script.unload, 0); }

    int get_instance(const Class* model, Class*& instance)
    {
        Instance* found = nullptr;
        const int status =
            answer("get_instance", script.get_instance, GET_INSTANCE_UNSUPPORTED, model, found);
        instance = static_cast<Class*>(found);
        return status;
    }
    int enum_instances(const Class* model, Enum_Instances_Handler<Class>* handler)
    {
        return answer("enum_instances", script.enum_instances, 0, model, deliver_to(handler));
    }
    int create_instance(Class* x)
    {
        return answer("create_instance", script.create_instance, CREATE_INSTANCE_UNSUPPORTED, x);
    }
    int delete_instance(const Class* x)
    {
        return answer("delete_instance", script.delete_instance, DELETE_INSTANCE_UNSUPPORTED, x);
    }
    int modify_instance(const Class* model, const Class* x)
    {
        return answer("modify_instance", script.modify_instance, MODIFY_INSTANCE_UNSUPPORTED, model, x);
    }
    static int invoke(Scripted_Provider&, const Class* self, Instance* method)
    {
        return answer("invoke", script.invoke, -1, self, method);
    }

    int enum_associator_names(const Instance* instance, const String& result_class, const String& role,
                              const String& result_role, Enum_Associator_Names_Handler<Instance>* handler)
    {
        return answer("enum_associator_names", script.enum_associator_names,
                      ENUM_ASSOCIATOR_NAMES_UNSUPPORTED, instance, joined(result_class, role, result_role),
                      deliver_to(handler));
    }
    int enum_associators(const Instance* instance, const String& result_class, const String& role,
                         const String& result_role, Enum_Associators_Handler<Instance>* handler)
    {
        return answer("enum_associators", script.enum_associators, ENUM_ASSOCIATORS_UNSUPPORTED, instance,
                      joined(result_class, role, result_role), deliver_to(handler));
    }
    int enum_references(const Instance* instance, const Class* model, const String& role,
                        Enum_References_Handler<Class>* handler)
    {
        return answer("enum_references", script.enum_references, ENUM_REFERENCES_UNSUPPORTED, instance, model,
                      std::string(role.c_str()), deliver_to(handler));
    }

    int enable_indications(Indication_Handler<Class>* handler)
    {
        _handler = handler;
        return answer("enable_indications", script.enable_indications, 0, deliver_to(handler));
    }
    int disable_indications()
    {
        const int status = answer("disable_indications", script.disable_indications, 0);
        delete _handler;
        _handler = nullptr;
        return status;
    }

private:
    template <class Function, class... Arguments>
    static int answer(const char* call, const Function& function, int otherwise, Arguments&&... arguments)
    {
        script.calls.push_back(call);
        return function ? function(arguments...) : otherwise;
    }

    template <class Handler>
    static Script::Deliver deliver_to(Handler* handler)
    {
        return [handler](Instance* instance) { return handler->handle(static_cast<Class*>(instance)); };
    }
    // Far ends are of any class.
    static Script::Deliver deliver_to(Instance_Handler<Instance>* handler)
    {
        return [handler](Instance* instance) { return handler->handle(instance); };
    }

    static std::string joined(const String& a, const String& b, const String& c)
    {
        return std::string(a.c_str()) + "|" + b.c_str() + "|" + c.c_str();
    }

    Indication_Handler<Class>* _handler = nullptr;
};

template <class T, Provider_Kind KIND>
inline constexpr Registration scripted_registration = {
    "sample_module", "Sample_Provider", dispatch<Scripted_Provider<T, KIND>>, &T::static_meta_class, nullptr};

inline constexpr const Registration* element_registration =
    &scripted_registration<Sample_Element, Provider_Kind::INSTANCE>;
inline constexpr const Registration* port_registration =
    &scripted_registration<Sample_Port, Provider_Kind::INSTANCE>;
inline constexpr const Registration* link_registration =
    &scripted_registration<Sample_Link, Provider_Kind::ASSOCIATION>;
inline constexpr const Registration* alert_registration =
    &scripted_registration<Sample_Element, Provider_Kind::INDICATION>;

/// An element or one of its kind, named.
template <class T = Sample_Element>
T* make_named(const char* name)
{
    T* const instance = create<T>(false);
    instance->Name.set(name);
    return instance;
}

/// Takes over both ends.
inline Sample_Link* make_link(Instance* antecedent, Instance* dependent)
{
    Sample_Link* const link = create<Sample_Link>(false);
    link->Antecedent = antecedent;
    link->Dependent = dependent;
    return link;
}

/// The name of any sample with one, for comparisons.
inline std::string name_of_sample(const Instance* instance)
{
    return static_cast<const Sample_Element*>(instance)->Name.value.c_str();
}

} // namespace KPRV
