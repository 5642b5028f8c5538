// What the server tells of itself in the interop namespace: its object manager, namespaces and communication.

#include "kldrcim/server/Interop_Space.h"

namespace KPRV::kldrcim {

namespace {

constexpr const char* manager_class = "CIM_ObjectManager";
constexpr const char* name_space_class = "CIM_Namespace";

/// An instance whose first properties are its keys.
Instance_Value instance_of(const char* class_name, std::vector<Named_Value> keys,
                           std::vector<Named_Value> others)
{
    Instance_Value instance;
    instance.path.class_name = class_name;
    instance.path.keys = keys;
    instance.properties = std::move(keys);
    instance.properties.insert(instance.properties.end(), others.begin(), others.end());
    return instance;
}

Result read_only()
{
    return failed(CMPI_RC_ERR_NOT_SUPPORTED, "the server's own objects cannot be changed");
}

} // namespace

Server_Objects::Server_Objects(const std::string& host_name, const std::string& version,
                               const std::vector<std::string>& name_spaces)
{
    const Plain_Value manager = Plain_Value::text("kldrcim:" + host_name);
    const Named_Value system_class{"SystemCreationClassName", Plain_Value::text("CIM_ComputerSystem")};
    const Named_Value system{"SystemName", Plain_Value::text(host_name)};
    constexpr std::uint64_t OK = 2, enabled = 2;
    _instances.push_back(instance_of(
        manager_class,
        {system_class, system, {"CreationClassName", Plain_Value::text(manager_class)}, {"Name", manager}},
        {{"ElementName", Plain_Value::text("kldrcim")},
         {"Description", Plain_Value::text("kldrcim " + version)},
         {"Started", Plain_Value::boolean(true)},
         {"EnabledState", Plain_Value::unsigned_number(CMPI_uint16, enabled)},
         {"OperationalStatus",
          Plain_Value::array(CMPI_uint16, {Plain_Value::unsigned_number(CMPI_uint16, OK)})}}));
    for (const std::string& name : name_spaces)
        _instances.push_back(
            instance_of(name_space_class,
                        {system_class,
                         system,
                         {"ObjectManagerCreationClassName", Plain_Value::text(manager_class)},
                         {"ObjectManagerName", manager},
                         {"CreationClassName", Plain_Value::text(name_space_class)},
                         {"Name", Plain_Value::text(name)}},
                        {{"ElementName", Plain_Value::text(name)}}));
}

bool Server_Objects::owns(std::string_view class_name) const
{
    return same_name(class_name, manager_class) || same_name(class_name, name_space_class);
}

Result Server_Objects::create(Instance_Value)
{
    return read_only();
}
Result Server_Objects::modify(const Instance_Value&, const Property_List&)
{
    return read_only();
}
Result Server_Objects::remove(const Path_Value&)
{
    return read_only();
}

} // namespace KPRV::kldrcim
