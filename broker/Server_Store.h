#pragma once

#include "broker/values/Request.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <functional>
#include <map>

namespace KPRV::broker {

class Class_Catalogue;

/// Instances that the server has besides those of the module, for up-calls: a test or a file puts in what a
/// provider should find. Safe for any thread.
class Server_Store
{
public:
    using Method = std::function<Result(const Request&)>;

    void add_name_space(const std::string& name_space);
    /// A class that the name space has, also where it has no instance; an enumeration is then empty, not
    /// refused. The superclass counts for classes that the module does not know. Adds the name space as well.
    void add_class(const std::string& name_space, const std::string& class_name,
                   const std::string& superclass = "");
    /// From now on every request to the name space is answered with that status.
    void refuse(const std::string& name_space, CMPIrc rc);
    /// Adds the name space as well.
    void add(const std::string& name_space, Instance_Value instance);
    /// Answers calls of that method on any instance of the class.
    void on_method(const std::string& name_space, const std::string& class_name, const std::string& method,
                   Method answer);

    bool has_name_space(const std::string& name_space) const;
    /// True if the class, an instance or a method of it was put in, or if the name space refuses all.
    bool serves(const Class_Catalogue& catalogue, const Path_Value& path) const;

    /// Rc 6 for an instance that is not there, 11 for one that is there already, 17 for an unknown method.
    Result run(const Class_Catalogue& catalogue, const Request& request);

    std::vector<Instance_Value> instances(const std::string& name_space) const;

private:
    struct Name_Space
    {
        std::vector<Instance_Value> instances;
        /// By lower-case "class.method".
        std::map<std::string, Method> methods;
        /// Lower-case superclasses by lower-case class.
        std::map<std::string, std::string> classes;
        std::optional<CMPIrc> refusal;

        bool is_a(const Class_Catalogue& catalogue, const std::string& class_name,
                  const std::string& ancestor) const;
    };

    /// All of `run` but a method, which is put into `method` for a call without the lock.
    Result look_up(const Class_Catalogue& catalogue, const Request& request, std::optional<Method>& method);
    static std::vector<Instance_Value>::iterator find(Name_Space& space, const Path_Value& path);
    Result change(Name_Space& space, const Request& request);
    Result enumerate(const Class_Catalogue& catalogue, const Name_Space& space, const Request& request) const;

    mutable Standard_Mutex<> _mutex;
    std::map<std::string, Name_Space, std::less<>> _spaces GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
