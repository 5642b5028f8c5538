#include "broker/values/Value_Text.h"
#include "module/runtime/dispatch/Registration.h"
#include "tests/module/exports/Module_Fixture.h"

#include <algorithm>
#include <functional>

namespace KPRV {
namespace {

using broker::Path_Value;
using broker::Result;

class Traversal : public Module_Fixture
{
protected:
    /// "FCPort 10000...": the class without its prefix, and the key that tells its instances apart.
    static std::string label(const Path_Value& path)
    {
        for (const char* key : {"DeviceID", "Tag", "InstanceID", "IdentifyingNumber", "Name"}) {
            if (const broker::Plain_Value* value = path.key(key))
                return path.class_name.substr(sizeof "KALDERA_" - 1) + " " + value->as_text();
        }
        ADD_FAILURE() << "no key tells the instances of " << path.class_name << " apart";
        return path.class_name;
    }
    static Lines labels(const Result& result)
    {
        Lines lines;
        for (const Path_Value& path : result.paths)
            lines.push_back(label(path));
        for (const broker::Instance_Value& instance : result.instances)
            lines.push_back(label(instance.path));
        return lines;
    }

    /// The one instance of the class whose label ends so.
    Path_Value find(const std::string& class_name, const std::string& id)
    {
        const Result all = server->enumerate_instance_names("KALDERA_" + class_name);
        for (const Path_Value& path : all.paths) {
            if (label(path).ends_with(id))
                return path;
        }
        throw std::invalid_argument("no " + class_name + " " + id);
    }

    /// Every association class that the module serves.
    std::vector<std::string> associations() const
    {
        std::vector<std::string> names;
        for (const Registration* each = server->module().registrations(); each; each = each->next) {
            if (each->meta_class->flags & FLAG_ASSOCIATION)
                names.push_back(each->meta_class->name);
        }
        return names;
    }

    Lines far_ends(const std::string& association, const Path_Value& path,
                   const broker::Association_Filter& filter = {})
    {
        const Result names = server->associator_names("KALDERA_" + association, path, filter);
        EXPECT_EQ(CMPI_RC_OK, names.rc);
        // The end of the answer is the entry's return alone.
        EXPECT_EQ(0u, names.done_count);
        return labels(names);
    }

    /// What the four operations must answer about one object, read off an enumeration; a role that is not
    /// empty is that of the object, or of the far ends.
    struct Seen
    {
        std::vector<Path_Value> far_ends;
        std::vector<broker::Instance_Value> associations;
    };
    static Seen seen_from(const Path_Value& near, const Result& enumeration, const std::string& role = "",
                          const std::string& result_role = "")
    {
        Seen seen;
        for (const broker::Instance_Value& association : enumeration.instances) {
            std::vector<Path_Value> others;
            bool touched = false;
            for (const broker::Named_Value& property : association.properties) {
                const Path_Value* end = property.value.as_path();
                if (!end)
                    continue;
                if (*end == near)
                    touched |= role.empty() || property.name == role;
                else if (result_role.empty() || property.name == result_role)
                    others.push_back(*end);
            }
            if (!touched)
                continue;
            seen.associations.push_back(association);
            seen.far_ends.insert(seen.far_ends.end(), others.begin(), others.end());
        }
        return seen;
    }
    static std::vector<Path_Value> ends_of(const Result& enumeration)
    {
        std::vector<Path_Value> ends;
        for (const broker::Instance_Value& association : enumeration.instances) {
            for (const broker::Named_Value& property : association.properties) {
                const Path_Value* end = property.value.as_path();
                if (end && std::find(ends.begin(), ends.end(), *end) == ends.end())
                    ends.push_back(*end);
            }
        }
        return ends;
    }
    /// The ends of each, as text that a failure can show.
    static Lines ends(std::vector<broker::Instance_Value> instances)
    {
        Lines lines;
        for (broker::Instance_Value& instance : instances) {
            std::erase_if(instance.properties, [](const auto& each) { return !each.value.as_path(); });
            lines.push_back(broker::mof_instance(instance));
        }
        return lines;
    }
    static std::vector<Path_Value> paths_of(const std::vector<broker::Instance_Value>& instances)
    {
        std::vector<Path_Value> paths;
        for (const broker::Instance_Value& instance : instances)
            paths.push_back(instance.path);
        return paths;
    }
};

// Those that a host with adapters, storage and optics has, whatever runs on it.
constexpr const char* populated[] = {
    "KALDERA_AdapterElementSoftwareIdentity",
    "KALDERA_AssociatedAlarm",
    "KALDERA_CommMechHostedAccessPoint",
    "KALDERA_CommMechanismForManager",
    "KALDERA_ControlledBy",
    "KALDERA_DeviceSAPImplementation",
    "KALDERA_ElementConformsToProfile",
    "KALDERA_ElementStatisticalData",
    "KALDERA_EthernetPortControlledBy",
    "KALDERA_EthernetPortRealizes",
    "KALDERA_EthernetPortSystemDevice",
    "KALDERA_FCPortSystemDevice",
    "KALDERA_HostedAccessPoint",
    "KALDERA_HostedCollection",
    "KALDERA_HostedDependency",
    "KALDERA_HostedLANEndpoint",
    "KALDERA_InstalledSoftwareIdentity",
    "KALDERA_LANEndpointDeviceSAPImplementation",
    "KALDERA_MemberOfCollection",
    "KALDERA_NamespaceInManager",
    "KALDERA_ObjectManagerHostedService",
    "KALDERA_PhysicalConnectorContainer",
    "KALDERA_PortControllerSystemDevice",
    "KALDERA_ProductElementComponent",
    "KALDERA_ProductPhysicalComponent",
    "KALDERA_ProfileElementSoftwareIdentity",
    "KALDERA_Realizes",
    "KALDERA_SCSIInitiatorTargetLogicalUnitPath",
    "KALDERA_StorageResourcesSystemDevice",
    "KALDERA_SubProfileRequiresProfile",
};

TEST_F(Traversal, YieldsFromEachEndWhatAnEnumerationHolds)
{
    open("rich.json");
    Lines with_instances;
    for (const std::string& association : associations()) {
        const Result all = server->enumerate_instances(association);
        EXPECT_EQ(CMPI_RC_OK, all.rc) << association;
        if (!all.instances.empty())
            with_instances.push_back(association);
        for (const Path_Value& end : ends_of(all)) {
            SCOPED_TRACE(association + " from " + label(end));
            const Seen seen = seen_from(end, all);
            EXPECT_EQ(seen.far_ends, server->associator_names(association, end, {}).paths);
            EXPECT_EQ(ends(seen.associations), ends(server->references(association, end, {}).instances));
            EXPECT_EQ(paths_of(seen.associations), server->reference_names(association, end, {}).paths);
            for (const broker::Named_Value& property : all.instances[0].properties) {
                if (!property.value.as_path())
                    continue;
                const std::string& role = property.name;
                const Seen in_role = seen_from(end, all, role);
                EXPECT_EQ(in_role.far_ends, server->associator_names(association, end, {.role = role}).paths);
                EXPECT_EQ(ends(in_role.associations),
                          ends(server->references(association, end, {.role = role}).instances));
                EXPECT_EQ(paths_of(in_role.associations),
                          server->reference_names(association, end, {.role = role}).paths);
                EXPECT_EQ(seen_from(end, all, "", role).far_ends,
                          server->associator_names(association, end, {.result_role = role}).paths);
            }
        }
    }
    for (const char* name : populated)
        EXPECT_NE(with_instances.end(), std::find(with_instances.begin(), with_instances.end(), name))
            << name;
}

TEST_F(Traversal, FetchesEachFarEndWholeThroughTheServer)
{
    open("demo.json");
    server->calls().record(true);
    for (const char* association : {"KALDERA_ControlledBy", "KALDERA_AssociatedAlarm", "KALDERA_Realizes"}) {
        const Result all = server->enumerate_instances(association);
        ASSERT_FALSE(all.instances.empty());
        for (const Path_Value& end : ends_of(all)) {
            SCOPED_TRACE(std::string(association) + " from " + label(end));
            const std::vector<Path_Value> expected = seen_from(end, all).far_ends;
            server->calls().clear();
            const Result far = server->associators(association, end, {});
            EXPECT_EQ(CMPI_RC_OK, far.rc);
            EXPECT_EQ(0u, far.done_count);
            EXPECT_EQ(expected, paths_of(far.instances));
            EXPECT_EQ(expected.size(), server->calls().calls("CBGetInstance").size());
            for (const broker::Instance_Value& instance : far.instances)
                EXPECT_EQ(server->get_instance(instance.path).instances.at(0), instance);
        }
    }
}

TEST_F(Traversal, StopsAtAFarEndThatTheServerCannotGive)
{
    open("demo.json");
    const Path_Value system = server->enumerate_instance_names("KALDERA_ComputerSystem").paths.at(0);
    EXPECT_EQ(3u, server->associators("KALDERA_PortControllerSystemDevice", system, {}).instances.size());
    server->calls().record(true);
    server->calls().fail("CBGetInstance", 2, CMPI_RC_ERR_NOT_FOUND);
    const Result far = server->associators("KALDERA_PortControllerSystemDevice", system, {});
    EXPECT_EQ(1u, far.instances.size());
    EXPECT_EQ(CMPI_RC_OK, far.rc);
    EXPECT_EQ(2u, server->calls().calls("CBGetInstance").size()) << "what comes after is not asked for";
}

TEST_F(Traversal, CostsOneEnumerationOfTheEndsAndOneForEachFarEnd)
{
    open("demo.json");
    const Path_Value adapter = find("PortController", "2000024b4c100000");
    mark();
    server->enumerate_instances("KALDERA_ControlledBy");
    const size_t enumeration = simulator.call_names().size();
    mark();
    server->enumerate_instances("KALDERA_FCPort");
    const size_t far_end = simulator.call_names().size();
    ASSERT_GT(far_end, 0u);
    mark();
    server->associator_names("KALDERA_ControlledBy", adapter, {});
    EXPECT_EQ(enumeration, simulator.call_names().size());
    mark();
    server->reference_names("KALDERA_ControlledBy", adapter, {});
    EXPECT_EQ(enumeration, simulator.call_names().size());
    mark();
    EXPECT_EQ(2u, server->associators("KALDERA_ControlledBy", adapter, {}).instances.size());
    EXPECT_EQ(enumeration + 2 * far_end, simulator.call_names().size());
}

TEST_F(Traversal, HeedsRolesAndClasses)
{
    open("demo.json");
    const Path_Value adapter = find("PortController", "2000024b4c100000");
    const Lines ports = {"FCPort 1000024b4c100000", "FCPort 1000024b4c100001"};
    EXPECT_EQ(ports, far_ends("ControlledBy", adapter));
    EXPECT_EQ(ports, far_ends("ControlledBy", adapter, {.role = "antecedent"}));
    EXPECT_EQ(Lines{}, far_ends("ControlledBy", adapter, {.role = "Dependent"}));
    EXPECT_EQ(ports, far_ends("ControlledBy", adapter, {.result_role = "DEPENDENT"}));
    EXPECT_EQ(Lines{}, far_ends("ControlledBy", adapter, {.result_role = "Antecedent"}));
    EXPECT_EQ(ports, far_ends("ControlledBy", adapter, {.role = "Antecedent", .result_role = "Dependent"}));
    // A class of the far end or one above it.
    for (const char* name : {"KALDERA_FCPort", "CIM_FCPort", "CIM_NetworkPort", "CIM_LogicalDevice",
                             "CIM_ManagedElement", "cim_logicalport"})
        EXPECT_EQ(ports, far_ends("ControlledBy", adapter, {.result_class = name})) << name;
    for (const char* name : {"KALDERA_EthernetPort", "CIM_Controller", "ACME_Unheard"})
        EXPECT_EQ(Lines{}, far_ends("ControlledBy", adapter, {.result_class = name})) << name;
}

TEST_F(Traversal, OfAPathWithThreeEndsYieldsTheOtherTwo)
{
    open("demo.json");
    const Result paths = server->enumerate_instances("KALDERA_SCSIInitiatorTargetLogicalUnitPath");
    const Path_Value unit = *paths.instances.at(0).property("LogicalUnit")->as_path();
    EXPECT_EQ(2u, far_ends("SCSIInitiatorTargetLogicalUnitPath", unit).size());
    EXPECT_EQ((Lines{label(*paths.instances[0].property("Initiator")->as_path())}),
              far_ends("SCSIInitiatorTargetLogicalUnitPath", unit, {.result_role = "Initiator"}));
    EXPECT_EQ((Lines{label(*paths.instances[0].property("Target")->as_path())}),
              far_ends("SCSIInitiatorTargetLogicalUnitPath", unit, {.result_role = "Target"}));
}

TEST_F(Traversal, OfALogicalDiskYieldsNothingAnywhere)
{
    open("rich.json");
    const Path_Value disk = server->enumerate_instance_names("KALDERA_LogicalDisk").paths.at(0);
    for (const std::string& association : associations()) {
        SCOPED_TRACE(association);
        const Result results[] = {
            server->associators(association, disk, {}), server->associator_names(association, disk, {}),
            server->references(association, disk, {}), server->reference_names(association, disk, {})};
        for (const Result& result : results) {
            EXPECT_EQ(CMPI_RC_OK, result.rc);
            EXPECT_TRUE(result.paths.empty() && result.instances.empty());
        }
    }
}

TEST_F(Traversal, OfWhatIsNotThereOrNotKnownIsEmptyAndASuccess)
{
    open("demo.json");
    Path_Value port = find("FCPort", "1000024b4c100000");
    set_value(port.keys, "DeviceID", broker::Plain_Value::text("1000000000000000"));
    EXPECT_EQ(Lines{}, far_ends("FCPortSystemDevice", port));
    mark();
    port.class_name = "ACME_Unheard";
    EXPECT_EQ(Lines{}, far_ends("FCPortSystemDevice", port));
    EXPECT_EQ(CMPI_RC_OK, server->associators("KALDERA_FCPortSystemDevice", port, {}).rc);
    EXPECT_EQ(CMPI_RC_OK, server->references("KALDERA_FCPortSystemDevice", port, {}).rc);
    EXPECT_EQ(CMPI_RC_OK, server->reference_names("KALDERA_FCPortSystemDevice", port, {}).rc);
    EXPECT_TRUE(simulator.call_names().empty());
}

// References fill what the provider left null: zeros and empty texts, as if they had been asked for by name.
TEST_F(Traversal, OfReferencesShowsNullPropertiesAsZeros)
{
    open("demo.json");
    const Result all = server->enumerate_instances("KALDERA_SCSIInitiatorTargetLogicalUnitPath");
    const Path_Value unit = *all.instances.at(0).property("LogicalUnit")->as_path();
    EXPECT_TRUE(!all.instances[0].property("State") || all.instances[0].property("State")->null);
    const Result seen = server->references("KALDERA_SCSIInitiatorTargetLogicalUnitPath", unit, {});
    const broker::Instance_Value& path = seen.instances.at(0);
    for (const char* name : {"State", "AdministrativeWeight", "LogicalUnitNumber"}) {
        ASSERT_TRUE(path.property(name)) << name;
        EXPECT_FALSE(path.property(name)->null) << name;
        EXPECT_EQ(0u, path.property(name)->as_uint()) << name;
    }
    EXPECT_EQ("", text_of(path, "OSDeviceName"));
    // Asked for some by name, it shows those alone.
    const Result some =
        server->references("KALDERA_SCSIInitiatorTargetLogicalUnitPath", unit, {}, {{"State"}});
    EXPECT_EQ("(absent)", text_of(some.instances.at(0), "OSDeviceName"));
    ASSERT_TRUE(some.instances[0].property("State"));
    EXPECT_FALSE(some.instances[0].property("State")->null);
}

TEST_F(Traversal, FailsWithTheEnumerationOfTheAssociation)
{
    open("rich.json");
    const char* const association = "KALDERA_LANEndpointDeviceSAPImplementation";
    const Path_Value port = find("EthernetPort", "024b4ca20000");
    mark();
    EXPECT_EQ(Lines{"LANEndpoint eth4"}, far_ends("LANEndpointDeviceSAPImplementation", port));
    const size_t queries = simulator.requests("getEthPortByEthMac").size();
    ASSERT_GT(queries, 1u);
    const std::function<Result()> calls[] = {
        [&] { return server->associators(association, port, {}); },
        [&] { return server->associator_names(association, port, {}); },
        [&] { return server->references(association, port, {}); },
        [&] { return server->reference_names(association, port, {}); },
    };
    for (const auto& call : calls) {
        // The last endpoint is lost, so that there are fewer of them than ports.
        simulator.clear_faults();
        mark();
        simulator.add_fault(R"({"call": "getEthPortByEthMac", "do": "null", "at": )" +
                            std::to_string(queries) + "}");
        const Result result = call();
        EXPECT_EQ(CMPI_RC_ERR_FAILED, result.rc);
        EXPECT_TRUE(result.paths.empty() && result.instances.empty());
        EXPECT_EQ((Lines{"DBG Entering: enum_instances", "ERR Error: Invalid mapping information!",
                         "DBG Returning: enum_instances"}),
                  said_by("KALDERA_LANEndpointDeviceSAPImplementation_Provider.cpp"));
    }
}

} // namespace
} // namespace KPRV
