#include "kldrcim/server/Interop_Classes.h"

namespace KPRV::kldrcim {

namespace {

struct Property_Row
{
    const char* name;
    CMPIType type;
    bool key;
    /// Of a reference.
    const char* target;
};

struct Class_Row
{
    const char* name;
    const char* superclass;
    bool is_association;
    std::initializer_list<Property_Row> properties;
};

// As the CIM Schema has them; what nobody fills is left out.
// clang-format off
const Class_Row class_table[] = {
    {"CIM_IndicationFilter", "CIM_ManagedElement", false,
     {{"SystemCreationClassName", CMPI_string, true, ""}, {"SystemName", CMPI_string, true, ""},
      {"CreationClassName", CMPI_string, true, ""}, {"Name", CMPI_string, true, ""},
      {"SourceNamespace", CMPI_string, false, ""}, {"SourceNamespaces", CMPI_stringA, false, ""},
      {"IndividualSubscriptionSupported", CMPI_boolean, false, ""}, {"Query", CMPI_string, false, ""},
      {"QueryLanguage", CMPI_string, false, ""}}},
    {"CIM_ListenerDestination", "CIM_ManagedElement", false,
     {{"SystemCreationClassName", CMPI_string, true, ""}, {"SystemName", CMPI_string, true, ""},
      {"CreationClassName", CMPI_string, true, ""}, {"Name", CMPI_string, true, ""},
      {"PersistenceType", CMPI_uint16, false, ""}, {"OtherPersistenceType", CMPI_string, false, ""},
      {"Destination", CMPI_string, false, ""}, {"Protocol", CMPI_uint16, false, ""},
      {"OtherProtocol", CMPI_string, false, ""}}},
    {"CIM_ListenerDestinationCIMXML", "CIM_ListenerDestination", false, {}},
    {"CIM_IndicationHandler", "CIM_ListenerDestination", false, {}},
    {"CIM_IndicationHandlerCIMXML", "CIM_IndicationHandler", false, {}},
    {"CIM_AbstractIndicationSubscription", "", true,
     {{"Filter", CMPI_ref, true, "CIM_IndicationFilter"}, {"Handler", CMPI_ref, true, "CIM_ListenerDestination"},
      {"OnFatalErrorPolicy", CMPI_uint16, false, ""}, {"OtherOnFatalErrorPolicy", CMPI_string, false, ""},
      {"FailureTriggerTimeInterval", CMPI_uint64, false, ""}, {"SubscriptionState", CMPI_uint16, false, ""},
      {"OtherSubscriptionState", CMPI_string, false, ""}, {"TimeOfLastStateChange", CMPI_dateTime, false, ""},
      {"SubscriptionDuration", CMPI_uint64, false, ""}, {"SubscriptionStartTime", CMPI_dateTime, false, ""},
      {"SubscriptionTimeRemaining", CMPI_uint64, false, ""}, {"RepeatNotificationPolicy", CMPI_uint16, false, ""},
      {"OtherRepeatNotificationPolicy", CMPI_string, false, ""},
      {"RepeatNotificationInterval", CMPI_uint64, false, ""}, {"RepeatNotificationGap", CMPI_uint64, false, ""},
      {"RepeatNotificationCount", CMPI_uint16, false, ""}}},
    {"CIM_IndicationSubscription", "CIM_AbstractIndicationSubscription", true, {}},
};
// clang-format on

Feature_Info feature_of(const Property_Row& row)
{
    Feature_Info info;
    info.name = row.name;
    info.type = row.type;
    info.key = row.key;
    info.target_class = row.target;
    info.default_value = Plain_Value::null_of(row.type);
    return info;
}

} // namespace

Interop_Classes::Interop_Classes(const Class_Catalogue& others) : _others(others)
{
    for (const Class_Row& row : class_table) {
        Class_Info info;
        info.name = row.name;
        info.superclass = row.superclass;
        info.is_association = row.is_association;
        info.has_provider = true;
        if (const Class_Info* above = find(info.superclass))
            info.properties = above->properties;
        for (const Property_Row& property : row.properties)
            info.properties.push_back(feature_of(property));
        _own.push_back(std::move(info));
    }
}

std::vector<std::string> Interop_Classes::class_names() const
{
    std::vector<std::string> names = _others.class_names();
    for (const Class_Info& info : _own)
        names.push_back(info.name);
    return names;
}

const Class_Info* Interop_Classes::find(std::string_view name) const
{
    for (const Class_Info& info : _own)
        if (same_name(info.name, name))
            return &info;
    return _others.find(name);
}

} // namespace KPRV::kldrcim
