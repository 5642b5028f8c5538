#pragma once

#include "host/Request.h"

#include <functional>
#include <map>
#include <mutex>

namespace KPRV::host {

class Class_Catalogue;

/// Instances that the server has besides those of the module, for up-calls: a test puts in what a provider
/// should find. Safe for any thread.
class Server_Store
{
public:
    using Method = std::function<Result(const Request&)>;

    void add_name_space(const std::string& name_space);
    /// Adds the name space as well.
    void add(const std::string& name_space, Instance_Value instance);
    /// Answers calls of that method on any instance of the class.
    void on_method(const std::string& name_space, const std::string& class_name, const std::string& method,
                   Method answer);

    bool has_name_space(const std::string& name_space) const;
    /// True if an instance or a method of that class was put in.
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
    };

    static std::vector<Instance_Value>::iterator find(Name_Space& space, const Path_Value& path);
    Result change(Name_Space& space, const Request& request);
    Result enumerate(const Class_Catalogue& catalogue, const Name_Space& space, const Request& request) const;

    mutable std::mutex mutex_;
    std::map<std::string, Name_Space, std::less<>> spaces_;
};

} // namespace KPRV::host
