// The providers of the small host: they serve its tables, the objects as instances and the links as
// associations, and count what they are asked.
#include "tests/broker/toy_fabric.h"
#include "tests/broker/toy.h"

#include <cstring>
#include <map>
#include <mutex>

namespace toy {

Broker_Slot broker;

namespace {

std::mutex count_mutex;
std::map<std::string, unsigned> counts;

void count(const std::string& class_name)
{
    std::lock_guard lock(count_mutex);
    ++counts[class_name];
}

std::string class_of(const CMPIObjectPath* path)
{
    return CMGetCharPtr(CMGetClassName(path, nullptr));
}

CMPIObjectPath* new_path(const CMPIObjectPath* like, const char* class_name)
{
    return CMNewObjectPath(broker, CMGetCharPtr(CMGetNameSpace(like, nullptr)), class_name, nullptr);
}

std::string key_text(const CMPIObjectPath* path)
{
    CMPIData data = CMGetKeyAt(path, 0, nullptr, nullptr);
    return data.type == CMPI_string ? CMGetCharPtr(data.value.string) : "";
}

std::string key_text(const Fabric_Object& object)
{
    return split(object.properties, ';', '=').front().text;
}

bool is_a(const std::string& class_name, const std::string& ancestor)
{
    if (class_name == ancestor)
        return true;
    const char* superclass = fabric_class(class_name).superclass;
    return superclass && is_a(superclass, ancestor);
}

CMPIObjectPath* object_path(const CMPIObjectPath* like, const Fabric_Object& object)
{
    CMPIObjectPath* path = new_path(like, object.class_name);
    Named_Text key = split(object.properties, ';', '=').front();
    CMAddKey(path, key.name.c_str(), key.text.c_str(), CMPI_chars);
    return path;
}

void set_property(CMPIInstance* instance, const Named_Text& given)
{
    CMPIValue value = {};
    char type = 's';
    for (const Fabric_Property& property : fabric_properties)
        if (given.name == property.name)
            type = property.type;
    switch (type) {
    case 'n':
        value.uint16 = static_cast<CMPIUint16>(std::stoul(given.text));
        CMSetProperty(instance, given.name.c_str(), &value, CMPI_uint16);
        break;
    case 'N':
        value.uint64 = std::stoull(given.text);
        CMSetProperty(instance, given.name.c_str(), &value, CMPI_uint64);
        break;
    case 'a': {
        CMPIUint16 number = static_cast<CMPIUint16>(std::stoul(given.text));
        value.array = CMNewArray(broker, 1, CMPI_uint16, nullptr);
        CMSetArrayElementAt(value.array, 0, &number, CMPI_uint16);
        CMSetProperty(instance, given.name.c_str(), &value, CMPI_uint16A);
        break;
    }
    default:
        CMSetProperty(instance, given.name.c_str(), given.text.c_str(), CMPI_chars);
    }
}

CMPIInstance* object_instance(const CMPIObjectPath* like, const Fabric_Object& object)
{
    CMPIInstance* instance = CMNewInstance(broker, object_path(like, object), nullptr);
    for (const Named_Text& property : split(object.properties, ';', '='))
        set_property(instance, property);
    return instance;
}

/// The path of an end: the object of the role's class that has the key.
CMPIObjectPath* end_path(const CMPIObjectPath* like, const std::string& role_class, const std::string& key)
{
    for (const Fabric_Object& object : fabric_objects)
        if (is_a(object.class_name, role_class) && key_text(object) == key)
            return object_path(like, object);
    return nullptr;
}

CMPIObjectPath* link_path(const CMPIObjectPath* like, const Fabric_Link& link)
{
    CMPIObjectPath* path = new_path(like, link.class_name);
    std::vector<Named_Text> roles = split(fabric_class(link.class_name).roles, ' ', ':');
    for (std::size_t i = 0; i < roles.size(); ++i) {
        CMPIObjectPath* end = end_path(like, roles[i].text, link.ends[i]);
        CMAddKey(path, roles[i].name.c_str(), &end, CMPI_ref);
    }
    return path;
}

CMPIStatus broken()
{
    return {CMPI_RC_ERR_FAILED, CMNewString(broker, "out of order", nullptr)};
}

/// Names or instances of the class of the path.
template <class Object, class Link>
CMPIStatus each(const CMPIObjectPath* path, Object on_object, Link on_link)
{
    std::string class_name = class_of(path);
    count(class_name);
    if (class_name == "TOY_Broken")
        return broken();
    for (const Fabric_Object& object : fabric_objects)
        if (class_name == object.class_name)
            on_object(object);
    for (const Fabric_Link& link : fabric_links)
        if (class_name == link.class_name)
            on_link(link);
    return ok;
}

CMPIStatus enumerate_names(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path)
{
    CMPIStatus status = each(
        path, [&](auto& object) { CMReturnObjectPath(result, object_path(path, object)); },
        [&](auto& link) { CMReturnObjectPath(result, link_path(path, link)); });
    return status.rc ? status : CMReturnDone(result);
}

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* path, const char**)
{
    CMPIStatus status = each(
        path, [&](auto& object) { CMReturnInstance(result, object_instance(path, object)); },
        [&](auto& link) { CMReturnInstance(result, CMNewInstance(broker, link_path(path, link), nullptr)); });
    return status.rc ? status : CMReturnDone(result);
}

CMPIStatus get(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
               const char**)
{
    for (const Fabric_Object& object : fabric_objects)
        if (class_of(path) == object.class_name && key_text(path) == key_text(object)) {
            CMReturnInstance(result, object_instance(path, object));
            return CMReturnDone(result);
        }
    return failed(CMPI_RC_ERR_NOT_FOUND);
}

CMPIStatus cannot_write(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                        const CMPIInstance*)
{
    return failed(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus cannot_modify(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                         const CMPIInstance*, const char**)
{
    return failed(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus cannot_delete(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*)
{
    return failed(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus cannot_query(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                        const char*, const char*)
{
    return failed(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean)
{
    return ok;
}

CMPIStatus association_cleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean)
{
    return ok;
}

bool passes(const char* filter, const std::string& name)
{
    return !filter || strcasecmp(filter, name.c_str()) == 0;
}

/// Calls `on_link(link, roles, near)` for each link of the provider's class that holds the object in an
/// admissible role.
template <class On_Link>
CMPIStatus each_link(CMPIAssociationMI* mi, const CMPIObjectPath* path, const char* role, On_Link on_link)
{
    std::string class_name = static_cast<const char*>(mi->hdl);
    count(class_name);
    if (class_name == "TOY_Broken")
        return broken();
    std::vector<Named_Text> roles = split(fabric_class(class_name).roles, ' ', ':');
    for (const Fabric_Link& link : fabric_links)
        for (std::size_t near = 0; class_name == link.class_name && near < roles.size(); ++near)
            if (passes(role, roles[near].name) && is_a(class_of(path), roles[near].text) &&
                key_text(path) == link.ends[near]) {
                on_link(link, roles, near);
                break;
            }
    return ok;
}

/// Calls `on_end(path)` for each far end.
template <class On_End>
CMPIStatus each_end(CMPIAssociationMI* mi, const CMPIObjectPath* path, const char* result_class,
                    const char* role, const char* result_role, On_End on_end)
{
    return each_link(mi, path, role, [&](const Fabric_Link& link, auto& roles, std::size_t near) {
        for (std::size_t i = 0; i < roles.size(); ++i) {
            CMPIObjectPath* end = end_path(path, roles[i].text, link.ends[i]);
            if (i != near && passes(result_role, roles[i].name) &&
                (!result_class || is_a(class_of(end), result_class)))
                on_end(end);
        }
    });
}

/// As the real module: names first, then each instance from the server.
CMPIStatus associators(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char*, const char* result_class, const char* role,
                       const char* result_role, const char** properties)
{
    return each_end(mi, path, result_class, role, result_role, [&](CMPIObjectPath* end) {
        if (CMPIInstance* instance = CBGetInstance(broker, context, end, properties, nullptr))
            CMReturnInstance(result, instance);
    });
}

CMPIStatus associator_names(CMPIAssociationMI* mi, const CMPIContext*, const CMPIResult* result,
                            const CMPIObjectPath* path, const char*, const char* result_class,
                            const char* role, const char* result_role)
{
    return each_end(mi, path, result_class, role, result_role,
                    [&](CMPIObjectPath* end) { CMReturnObjectPath(result, end); });
}

CMPIStatus references(CMPIAssociationMI* mi, const CMPIContext*, const CMPIResult* result,
                      const CMPIObjectPath* path, const char*, const char* role, const char**)
{
    return each_link(mi, path, role, [&](const Fabric_Link& link, auto&, std::size_t) {
        CMReturnInstance(result, CMNewInstance(broker, link_path(path, link), nullptr));
    });
}

CMPIStatus reference_names(CMPIAssociationMI* mi, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path, const char*, const char* role)
{
    return each_link(mi, path, role, [&](const Fabric_Link& link, auto&, std::size_t) {
        CMReturnObjectPath(result, link_path(path, link));
    });
}

CMPIInstanceMIFT instance_table = {100,         100, "fabric",     cleanup,       enumerate_names,
                                   enumerate,   get, cannot_write, cannot_modify, cannot_delete,
                                   cannot_query};
CMPIInstanceMI instance_mi = {nullptr, &instance_table};
CMPIAssociationMIFT association_table = {
    100, 100, nullptr, association_cleanup, associators, associator_names, references, reference_names};

} // namespace
} // namespace toy

/// How often the providers of a class were asked, by enumeration or traversal.
TOY_EXPORT unsigned fabric_count(const char* class_name)
{
    std::lock_guard lock(toy::count_mutex);
    return toy::counts[class_name];
}

#define INSTANCES(CLASS)                                                                                     \
    TOY_EXPORT CMPIInstanceMI* CLASS##_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*,           \
                                                         CMPIStatus*)                                        \
    {                                                                                                        \
        toy::broker = mb;                                                                                    \
        return &toy::instance_mi;                                                                            \
    }

#define ASSOCIATION(CLASS)                                                                                   \
    INSTANCES(CLASS)                                                                                         \
    TOY_EXPORT CMPIAssociationMI* CLASS##_Create_AssociationMI(const CMPIBroker* mb, const CMPIContext*,     \
                                                               CMPIStatus*)                                  \
    {                                                                                                        \
        static CMPIAssociationMI mi = {const_cast<char*>(#CLASS), &toy::association_table};                  \
        toy::broker = mb;                                                                                    \
        return &mi;                                                                                          \
    }

INSTANCES(KALDERA_ComputerSystem)
INSTANCES(KALDERA_PortController)
INSTANCES(KALDERA_PhysicalPackage)
INSTANCES(KALDERA_PhysicalConnector)
INSTANCES(KALDERA_AdapterSoftwareIdentity)
INSTANCES(KALDERA_FCPort)
INSTANCES(KALDERA_EthernetPort)
INSTANCES(KALDERA_SCSIProtocolEndpoint)
INSTANCES(KALDERA_StorageExtent)
INSTANCES(KALDERA_TapeDrive)
INSTANCES(TOY_Service)
INSTANCES(KALDERA_RegisteredProfile)
INSTANCES(KALDERA_RegisteredSubProfile)
INSTANCES(KALDERA_ProfileSoftwareIdentity)
ASSOCIATION(KALDERA_PortControllerSystemDevice)
ASSOCIATION(TOY_PortSystemDevice)
ASSOCIATION(TOY_Scope)
ASSOCIATION(KALDERA_ControlledBy)
ASSOCIATION(KALDERA_EthernetPortControlledBy)
ASSOCIATION(KALDERA_AdapterElementSoftwareIdentity)
ASSOCIATION(KALDERA_Realizes)
ASSOCIATION(KALDERA_PhysicalConnectorContainer)
ASSOCIATION(KALDERA_EthernetPortRealizes)
ASSOCIATION(KALDERA_HostedDependency)
ASSOCIATION(KALDERA_DeviceSAPImplementation)
ASSOCIATION(KALDERA_SCSIInitiatorTargetLogicalUnitPath)
ASSOCIATION(KALDERA_ElementConformsToProfile)
ASSOCIATION(KALDERA_SubProfileRequiresProfile)
ASSOCIATION(KALDERA_ProfileElementSoftwareIdentity)
ASSOCIATION(TOY_Broken)
