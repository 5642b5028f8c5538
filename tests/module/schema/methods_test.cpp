#include "tests/module/schema/Catalogue_View.h"

#include "module/schema/CIM_Capabilities_methods.h"
#include "module/schema/KALDERA_AgentService_methods.h"

#include <gtest/gtest.h>
#include <set>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

struct Method_Row
{
    const char* owner;
    const char* name;
    std::string return_type;
    bool experimental;
    std::vector<std::string> parameters;
};

const Method_Row method_rows[] = {
#include "tests/module/schema/methods.inc"
};

/// "in uint16 Speed": direction, type, name, and the marks that are rare.
std::string shown(const Meta_Feature& parameter)
{
    const uint32 direction = parameter.flags & (FLAG_IN | FLAG_OUT);
    std::string text = direction == FLAG_IN ? "in " : direction == FLAG_OUT ? "out " : "inout ";
    if (parameter.flags & FLAG_REFERENCE)
        text += parameter.flags & FLAG_EMBEDDED_INSTANCE ? "embedded " : "ref ";
    text += type(parameter) + " " + parameter.name;
    for (const Flag flag : {FLAG_REQUIRED, FLAG_OCTET_STRING})
        if (parameter.flags & flag)
            text += " " + flags(flag);
    return text;
}

TEST(Methods, HaveTheirOwnersAndParameters)
{
    ASSERT_EQ(std::size(method_rows), 52u);
    for (const Method_Row& row : method_rows) {
        SCOPED_TRACE(std::string(row.owner) + "." + row.name);
        const Meta_Class& owner = find(row.owner);
        const uint32 at = position(owner, row.name);
        EXPECT_EQ(owner.locals[at], 1);
        const Meta_Method& method = as_method(*owner.meta_features[at]);
        EXPECT_EQ(flags(method.flags), row.experimental ? "Method,Experimental" : "Method");
        EXPECT_EQ(type(method), row.return_type);
        ASSERT_EQ(method.num_meta_features, row.parameters.size() + 1);
        for (size_t i = 0; i < row.parameters.size(); i++)
            EXPECT_EQ(shown(*method.meta_features[i]), row.parameters[i]);
        EXPECT_EQ(shown(*method.meta_features[row.parameters.size()]),
                  "out " + row.return_type + " return_value");
    }
}

/// The methods that clients can ask of the product classes, inherited ones included; all other classes have
/// none.
struct Served_Row
{
    std::set<std::string> classes;
    std::set<std::string> methods;
};

const std::set<std::string> of_devices = {"RequestStateChange", "SetPowerState",    "Reset",
                                          "EnableDevice",       "OnlineDevice",     "QuiesceDevice",
                                          "SaveProperties",     "RestoreProperties"};

std::set<std::string> operator+(std::set<std::string> a, const std::set<std::string>& b)
{
    a.insert(b.begin(), b.end());
    return a;
}

const std::set<std::string> of_services = {"RequestStateChange", "StartService", "StopService",
                                           "ChangeAffectedElementsAssignedSequence"};

const Served_Row served_rows[] = {
    {{"FCPort", "EthernetPort", "PortController", "StorageExtent", "LogicalDisk"}, of_devices},
    {{"TapeDrive"}, of_devices + std::set<std::string>{"LockMedia"}},
    {{"AlarmDevice"}, of_devices + std::set<std::string>{"SetAlarmIndicator", "SetAlarmState", "SetUrgency"}},
    {{"ComputerSystem"}, {"RequestStateChange", "SetPowerState"}},
    {{"CIMXMLCommunicationMechanism", "RemoteServiceAccessPoint"}, {"RequestStateChange"}},
    {{"LANEndpoint", "SCSIProtocolEndpoint"}, {"RequestStateChange", "BroadcastReset"}},
    {{"ObjectManager"}, of_services},
    {{"ConcreteJob"}, {"KillJob", "RequestStateChange", "GetError", "GetErrors"}},
    {{"FCPortStatistics"}, {"ResetSelectedStats"}},
    {{"PhysicalPackage"}, {"IsCompatible"}},
    {{"RegisteredProfile", "RegisteredSubProfile"},
     {"OpenConformantInstances", "PullConformantInstances", "CloseConformantInstances"}},
    {{"HBASoftwareInstallationServiceCapabilities"}, {"CreateGoalSettings"}},
    {{"HBASoftwareInstallationService"},
     of_services + std::set<std::string>{"CheckSoftwareIdentity", "InstallFromByteStream",
                                         "InstallFromSoftwareIdentity", "InstallFromURI"}},
    {{"DiagnosticTest", "MemoryDiagnosticTest", "LoopbackDiagnosticTest", "PCILoopbackDiagnosticTest",
      "EthLoopbackDiagnosticTest"},
     of_services + std::set<std::string>{"RunDiagnostic", "RunDiagnosticService", "RunTest", "ClearResults",
                                         "DiscontinueTest"}},
    {{"AgentService"}, {"executeMethod"}},
};

TEST(Methods, OfTheProductClassesWithWhatTheyInherit)
{
    for (const Meta_Class* meta_class : classes()) {
        const std::string name = meta_class->name;
        if (!name.starts_with("KALDERA_"))
            continue;
        std::set<std::string> expected, found;
        for (const Served_Row& row : served_rows)
            if (row.classes.count(name.substr(8)))
                expected = row.methods;
        for (uint32 i = 0; i < meta_class->num_meta_features; i++)
            if (meta_class->meta_features[i]->flags & FLAG_METHOD)
                found.insert(meta_class->meta_features[i]->name);
        EXPECT_EQ(found, expected) << name;
    }
}

TEST(Methods, NoOtherRecordExists)
{
    size_t count = 0;
    for (const Meta_Class* meta_class : classes())
        for (const Meta_Feature* feature : own_features(*meta_class))
            count += bool(feature->flags & FLAG_METHOD);
    EXPECT_EQ(count, std::size(method_rows));
}

TEST(Methods, ARecordIsTheClassOfItsInvocations)
{
    using Record = KALDERA_AgentService_executeMethod_method;
    EXPECT_EQ(Record::static_meta_class.size, sizeof(Record));
    auto* record = static_cast<Record*>(create(&Record::static_meta_class));
    EXPECT_EQ(record->__meta_class, as_class(&Record::static_meta_class));
    EXPECT_EQ(record->request.null, 0);
    EXPECT_EQ(record->return_value.value, 0u);
    record->request.set("{}");
    unref(record);
}

// Embedded instances are references, so an array of them holds instances.
TEST(Methods, EmbeddedInstancesAreHeldAsInstances)
{
    auto* record = static_cast<CIM_Capabilities_CreateGoalSettings_method*>(
        create(&CIM_Capabilities_CreateGoalSettings_method::static_meta_class));
    Instance* const setting = create(&find("CIM_DiagnosticSettingData"), true);
    record->TemplateGoalSettings.value.append(setting);
    EXPECT_EQ(record->TemplateGoalSettings.value.size(), 1u);
    unref(record);
}

} // namespace
