#pragma once

#include "kldrcim/connection/Connection.h"

#include <unordered_map>

namespace KPRV::kldrcim {

using namespace broker;

/// Asks the module for associations and instances, each enumeration once, and answers from what it kept. A
/// traversal would cost the module one enumeration per object that it starts at, and one more per object
/// found.
class Association_Index
{
public:
    explicit Association_Index(Connection& connection) : _connection(connection) {}

    /// The far ends of the links of an association whose near role holds the object, each once, in the order
    /// of the enumeration. With `above_role`, only of links where that role holds `above`.
    std::vector<Path_Value> far_ends(const char* association, const char* near_role, const Path_Value& object,
                                     const char* far_role, const char* above_role = nullptr,
                                     const Path_Value* above = nullptr);

    /// The names of the instances of a class, or of the links of an association, which it keeps.
    const std::vector<Path_Value>& names(const std::string& class_name);

    /// The instances of a class.
    const std::vector<Instance_Value>& instances(const std::string& class_name);

    /// The instance behind a path. If the module does not have it, the path with its keys as properties.
    Instance_Value instance(const Path_Value& path);

    /// Enumerations that failed, in the order in which they were made.
    const std::vector<Provider_Failure>& failures() const { return _failures; }

private:
    struct Class_Instances
    {
        std::vector<Instance_Value> instances;
        std::unordered_map<std::string, std::size_t> by_path;
    };
    using Positions = std::unordered_map<std::string, std::vector<std::size_t>>;

    const Class_Instances& class_instances(const std::string& class_name);
    void note_failure(const std::string& class_name, const Result& result);

    Connection& _connection;
    std::unordered_map<std::string, std::vector<Path_Value>> _names;
    /// By association and near role: positions in the links by the identity of the near end.
    std::unordered_map<std::string, Positions> _positions;
    std::unordered_map<std::string, Class_Instances> _instances;
    std::vector<Provider_Failure> _failures;
};

} // namespace KPRV::kldrcim
