#include "tests/module/exports/Rich_Fixture.h"

#include <set>

namespace KPRV {
namespace {

using rich::Calls;

struct Association
{
    std::string name;
    /// In the order in which they are written down.
    std::vector<std::string> roles;
    /// The end classes, in the order in which they are fetched.
    std::vector<std::string> fetched;
    /// What the join itself asks for.
    Calls (*joining)() = nullptr;
};

Calls fc_ports_by_adapter()
{
    Calls calls;
    for (const rich::Adapter& adapter : rich::adapters())
        rich::append(calls, rich::fc_walk(adapter));
    return calls;
}

Calls ethernet_ports_by_adapter()
{
    Calls calls;
    for (const rich::Adapter& adapter : rich::adapters())
        rich::append(calls, rich::ethernet_walk_by_port(adapter));
    return calls;
}

/// Both sides of the converged adapter; plain FC adapters are passed over unasked.
Calls both_sides()
{
    const rich::Adapter& converged = rich::adapters()[1];
    Calls calls = rich::fc_walk(converged);
    rich::append(calls, rich::ethernet_walk_by_port(converged));
    return calls;
}

/// The adapters that the connectors sit in, in their order.
std::vector<rich::Adapter> connector_adapters()
{
    const std::vector<rich::Adapter>& all = rich::adapters();
    return {all[0], all[0], all[1], all[2]};
}

/// A serial number for each package and connector.
Calls serial_numbers()
{
    Calls calls;
    for (size_t package = 0; package < 3; package++) {
        for (const rich::Adapter& adapter : connector_adapters())
            rich::append(calls, {rich::adapter_list, rich::adapter_data(adapter)});
    }
    return calls;
}

Calls ethernet_ports_by_connector()
{
    Calls calls;
    for (const rich::Adapter& adapter : connector_adapters())
        rich::append(calls, rich::ethernet_walk(adapter, true));
    return calls;
}

const std::string SYSTEM = "KALDERA_ComputerSystem", CONTROLLER = "KALDERA_PortController",
                  PORT = "KALDERA_FCPort", ENDPOINT = "KALDERA_SCSIProtocolEndpoint",
                  STATISTICS = "KALDERA_FCPortStatistics", PACKAGE = "KALDERA_PhysicalPackage",
                  PRODUCT = "KALDERA_Product", SOFTWARE = "KALDERA_AdapterSoftwareIdentity",
                  EXTENT = "KALDERA_StorageExtent", TAPE = "KALDERA_TapeDrive",
                  ETHERNET = "KALDERA_EthernetPort", GROUP = "KALDERA_LogicalPortGroup",
                  LAN = "KALDERA_LANEndpoint", CONNECTOR = "KALDERA_PhysicalConnector",
                  ALARM = "KALDERA_AlarmDevice";

// clang-format off
const std::vector<Association> associations = {
    {"KALDERA_FCPortSystemDevice",             {"GroupComponent", "PartComponent"}, {SYSTEM, PORT}},
    {"KALDERA_EthernetPortSystemDevice",       {"GroupComponent", "PartComponent"}, {SYSTEM, ETHERNET}},
    {"KALDERA_PortControllerSystemDevice",     {"GroupComponent", "PartComponent"}, {SYSTEM, CONTROLLER}},
    {"KALDERA_StorageResourcesSystemDevice",   {"GroupComponent", "PartComponent"}, {SYSTEM, EXTENT, TAPE}},
    {"KALDERA_HostedAccessPoint",              {"Antecedent", "Dependent"},         {SYSTEM, ENDPOINT}},
    {"KALDERA_HostedLANEndpoint",              {"Antecedent", "Dependent"},         {SYSTEM, LAN}},
    {"KALDERA_HostedCollection",               {"Antecedent", "Dependent"},         {SYSTEM, GROUP}},
    {"KALDERA_InstalledSoftwareIdentity",      {"System", "InstalledSoftware"},     {SYSTEM, SOFTWARE}},
    {"KALDERA_ControlledBy",                   {"Antecedent", "Dependent"},         {CONTROLLER}, fc_ports_by_adapter},
    {"KALDERA_EthernetPortControlledBy",       {"Antecedent", "Dependent"},         {CONTROLLER}, ethernet_ports_by_adapter},
    {"KALDERA_Realizes",                       {"Antecedent", "Dependent"},         {CONTROLLER, PACKAGE}},
    {"KALDERA_ProductPhysicalComponent",       {"GroupComponent", "PartComponent"}, {PACKAGE, PRODUCT}},
    {"KALDERA_ProductElementComponent",        {"GroupComponent", "PartComponent"}, {CONTROLLER, PRODUCT}},
    {"KALDERA_AdapterElementSoftwareIdentity", {"Antecedent", "Dependent"},         {SOFTWARE, CONTROLLER}},
    {"KALDERA_AssociatedAlarm",                {"Antecedent", "Dependent"},         {PORT, ALARM}},
    {"KALDERA_ElementStatisticalData",         {"ManagedElement", "Stats"},         {PORT, STATISTICS}},
    {"KALDERA_MemberOfCollection",             {"Collection", "Member"},            {PORT, GROUP}},
    {"KALDERA_DeviceSAPImplementation",        {"Antecedent", "Dependent"},         {ENDPOINT, PORT}},
    {"KALDERA_LANEndpointDeviceSAPImplementation", {"Antecedent", "Dependent"},     {ETHERNET, LAN}},
    {"KALDERA_PhysicalConnectorContainer",     {"GroupComponent", "PartComponent"}, {CONNECTOR, PACKAGE}, serial_numbers},
    {"KALDERA_EthernetPortRealizes",           {"Antecedent", "Dependent"},         {CONNECTOR}, ethernet_ports_by_connector},
    {"KALDERA_HostedDependency",               {"Antecedent", "Dependent"},         {CONTROLLER}, both_sides},
    {"KALDERA_SCSIInitiatorTargetLogicalUnitPath", {"Initiator", "Target", "LogicalUnit"}, {EXTENT, TAPE, ENDPOINT}},
};
// clang-format on

Calls cost_of(const Association& association)
{
    Calls calls;
    for (const std::string& class_name : association.fetched)
        rich::append(calls, rich::cost_of(class_name));
    if (association.joining)
        rich::append(calls, association.joining());
    return calls;
}

class Rich_Associations : public Rich_Fixture
{
protected:
    /// Class and the one key that tells its instances apart.
    static std::string end_text(const broker::Plain_Value* end, const std::string& host_name)
    {
        const broker::Path_Value* path = end ? end->as_path() : nullptr;
        if (!path)
            return "(none)";
        for (const char* key : {"DeviceID", "InstanceID", "Tag", "IdentifyingNumber", "Name"}) {
            if (const broker::Plain_Value* value = path->key(key)) {
                const std::string& text = value->as_text();
                return path->class_name.substr(std::string("KALDERA_").size()) + " " +
                       (text == host_name ? "@HOST@" : text);
            }
        }
        return path->class_name + " (no key)";
    }

    static std::string joined(const std::vector<std::string>& parts)
    {
        std::string text;
        for (const std::string& part : parts)
            text += (text.empty() ? "" : " -> ") + part;
        return text + "\n";
    }

    std::string all_pairs()
    {
        const std::string host_name = This_Host::find().name;
        std::string text;
        for (const Association& association : associations) {
            text += association.name + ": " + joined(association.roles);
            for (const broker::Instance_Value& instance : enumerate(association.name).instances) {
                std::vector<std::string> ends;
                for (const std::string& role : association.roles)
                    ends.push_back(end_text(instance.property(role), host_name));
                text += joined(ends);
            }
            text += "\n";
        }
        return text;
    }
};

TEST_F(Rich_Associations, JoinWhatIsWrittenDownInThatOrder)
{
    open_rich();
    expect_golden("rich_associations", all_pairs(), ".txt");
}

TEST_F(Rich_Associations, JoinTheSameUnderTheHabitsOfBothServers)
{
    under_both_servers([&] { expect_golden("rich_associations", all_pairs(), ".txt"); });
}

TEST_F(Rich_Associations, HaveEndsThatExistAndNoOtherProperty)
{
    open_rich();
    std::map<std::string, std::set<std::string>> known;
    for (const Association& association : associations) {
        SCOPED_TRACE(association.name);
        for (const broker::Instance_Value& instance : enumerate(association.name).instances) {
            for (const broker::Named_Value& property : instance.properties) {
                if (property.value.null)
                    continue;
                const broker::Path_Value* end = property.value.as_path();
                ASSERT_TRUE(end) << property.name;
                std::set<std::string>& names = known[end->class_name];
                if (names.empty()) {
                    for (const broker::Path_Value& path :
                         server->enumerate_instance_names(end->class_name).paths)
                        names.insert(broker::path_text(path));
                }
                EXPECT_EQ(1u, names.count(broker::path_text(*end))) << broker::path_text(*end);
            }
        }
    }
    EXPECT_EQ(15u, known.size()) << "a logical disk alone is at no end";
    EXPECT_EQ(0u, known.count("KALDERA_LogicalDisk"));
}

TEST_F(Rich_Associations, CostWhatTheirEndsCostAndTheirJoin)
{
    open_rich();
    for (const Association& association : associations) {
        SCOPED_TRACE(association.name);
        mark();
        enumerate(association.name);
        EXPECT_EQ(cost_of(association), rich::recorded(simulator));
    }
}

TEST_F(Rich_Associations, AreNamedAndFoundAsTheyAreEnumerated)
{
    under_both_servers([&] {
        for (const Association& association : associations)
            expect_named_and_found(association.name, cost_of(association));
    });
}

} // namespace
} // namespace KPRV
