// Association requests that go to several providers, as clients and up-calls send them.
#include "broker/Association_Routing.h"

#include "tests/broker/Toy_Server.h"

#include "contracts/cmpi/cmpimacs.h"

namespace KPRV::broker {
namespace {

Path_Value object(const char* class_name, const char* key, const char* text)
{
    return {.class_name = class_name, .keys = {{key, Plain_Value::text(text)}}};
}

const Path_Value the_system = object("KALDERA_ComputerSystem", "Name", "10.0.0.5");
const Path_Value tape = object("KALDERA_TapeDrive", "DeviceID", "tape_only");

class Association_Routing : public Toy_Test
{
protected:
    Association_Routing() { server = open_toy(TOY_FABRIC); }

    Result ask(Operation operation, const Path_Value& path, const Association_Filter& filter = {})
    {
        return server->run({.operation = operation, .path = path, .filter = filter});
    }

    std::vector<std::string> classes(const char* class_name, const Association_Filter& filter = {})
    {
        return association_classes(
            server->catalogue(),
            {.operation = Operation::ASSOCIATORS, .path = {.class_name = class_name}, .filter = filter});
    }

    static std::string keys(const std::vector<Path_Value>& paths)
    {
        std::string text;
        for (const Path_Value& path : paths)
            text += path.keys.at(0).value.as_text() + " ";
        return text;
    }
};

TEST_F(Association_Routing, WithoutAClassEveryRoleThatHoldsTheObjectCounts)
{
    // By the class itself, by its superclass and by the superclass of that; abstract associations too, since
    // only the library knows who has a provider.
    EXPECT_EQ(
        (std::vector<std::string>{"TOY_Component", "TOY_PortSystemDevice", "KALDERA_EthernetPortControlledBy",
                                  "KALDERA_EthernetPortRealizes", "KALDERA_HostedDependency",
                                  "KALDERA_SCSIInitiatorTargetLogicalUnitPath"}),
        classes("KALDERA_EthernetPort"));
    // A role of a subclass cannot hold it.
    EXPECT_EQ((std::vector<std::string>{"TOY_Component", "KALDERA_SCSIInitiatorTargetLogicalUnitPath"}),
              classes("TOY_Element"));
    EXPECT_TRUE(classes("TOY_Unheard").empty());
}

TEST_F(Association_Routing, ANamedClassBringsItsSubclasses)
{
    EXPECT_EQ((std::vector<std::string>{"TOY_Component", "KALDERA_PortControllerSystemDevice",
                                        "TOY_PortSystemDevice"}),
              classes("KALDERA_ComputerSystem", {.association_class = "toy_component"}));
    // No association.
    EXPECT_TRUE(classes("KALDERA_ComputerSystem", {.association_class = "TOY_Port"}).empty());
}

TEST_F(Association_Routing, WhatSeveralReportComesOnce)
{
    Result names = ask(Operation::ASSOCIATOR_NAMES, the_system);
    EXPECT_EQ(CMPI_RC_OK, names.rc);
    EXPECT_EQ("2000024b4c100000 00024b4c2000 1000024b4c100000 ", keys(names.paths));
    EXPECT_TRUE(names.failures.empty());
    Result instances = ask(Operation::ASSOCIATORS, the_system);
    ASSERT_EQ(3u, instances.instances.size());
    EXPECT_EQ("Kaldera CNA", instances.instances[1].property("Caption")->as_text());
    // Each link is an object of its own.
    EXPECT_EQ(5u, ask(Operation::REFERENCE_NAMES, the_system).paths.size());
    EXPECT_EQ(5u, ask(Operation::REFERENCES, the_system).instances.size());
}

TEST_F(Association_Routing, Filters)
{
    EXPECT_EQ("1000024b4c100000 ",
              keys(ask(Operation::ASSOCIATOR_NAMES, the_system, {.result_class = "TOY_Port"}).paths));
    EXPECT_EQ("2000024b4c100000 00024b4c2000 ",
              keys(ask(Operation::ASSOCIATOR_NAMES, the_system, {.role = "Antecedent"}).paths));
    EXPECT_EQ("2000024b4c100000 00024b4c2000 1000024b4c100000 ",
              keys(ask(Operation::ASSOCIATOR_NAMES, the_system,
                       {.association_class = "TOY_Component", .result_role = "PartComponent"})
                       .paths));
    EXPECT_EQ(2u, ask(Operation::REFERENCE_NAMES, the_system, {.result_class = "TOY_Scope"}).paths.size());
}

TEST_F(Association_Routing, FailsOnlyIfAllFail)
{
    Result some = ask(Operation::REFERENCE_NAMES, tape);
    EXPECT_EQ(CMPI_RC_OK, some.rc);
    EXPECT_EQ(1u, some.paths.size());
    ASSERT_EQ(1u, some.failures.size());
    EXPECT_EQ("TOY_Broken", some.failures[0].provider_class);
    EXPECT_EQ("out of order", some.failures[0].message);
    Result all = ask(Operation::REFERENCE_NAMES, tape, {.result_class = "TOY_Broken"});
    EXPECT_EQ(CMPI_RC_ERR_FAILED, all.rc);
    EXPECT_EQ("out of order", all.message);
}

TEST_F(Association_Routing, TheFirstFailureIsTheAnswer)
{
    Association_Merge merge;
    merge.add("A", {.rc = CMPI_RC_ERR_ACCESS_DENIED, .message = "no"});
    merge.add("B", {.rc = CMPI_RC_ERR_FAILED});
    Result result = merge.settle();
    EXPECT_EQ(CMPI_RC_ERR_ACCESS_DENIED, result.rc);
    EXPECT_EQ("no", result.message);
    EXPECT_EQ(2u, result.failures.size());
}

TEST_F(Association_Routing, ObjectsOfTwoNameSpacesAreTwo)
{
    Path_Value elsewhere = tape;
    elsewhere.name_space = "root/other";
    Association_Merge merge;
    merge.add("A", {.paths = {tape, elsewhere, tape}});
    EXPECT_EQ(2u, merge.settle().paths.size());
}

TEST_F(Association_Routing, UnknownAndUnservedClasses)
{
    EXPECT_EQ(CMPI_RC_ERR_INVALID_CLASS,
              ask(Operation::ASSOCIATOR_NAMES, tape, {.association_class = "TOY_Unheard"}).rc);
    EXPECT_EQ(CMPI_RC_ERR_INVALID_CLASS,
              ask(Operation::ASSOCIATOR_NAMES, object("TOY_Unheard", "Id", "1")).rc);
    // An object of somebody else's class may be asked about by a named association: it has none.
    Result foreign = ask(Operation::ASSOCIATOR_NAMES, object("TOY_Unheard", "Id", "1"),
                         {.association_class = "TOY_Scope"});
    EXPECT_EQ(CMPI_RC_OK, foreign.rc);
    EXPECT_TRUE(foreign.paths.empty());
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED,
              ask(Operation::ASSOCIATOR_NAMES, tape, {.association_class = "TOY_Port"}).rc);
    // A module that hides its classes can be asked by name only.
    server = open_toy(TOY_PLAIN);
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, ask(Operation::ASSOCIATOR_NAMES, item(1)).rc);
    EXPECT_EQ(1u, ask(Operation::ASSOCIATOR_NAMES, item(1), {.association_class = "TOY_Link"}).paths.size());
}

TEST_F(Association_Routing, UpCallsNeedNoClassEither)
{
    const CMPIBroker* broker = server->broker().cmpi();
    Argument<Context_Object> context(*server->broker().core());
    Call_Frame frame(server->broker().core(), context.cmpi());
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/toy", "KALDERA_ComputerSystem", nullptr);
    CMAddKey(path, "Name", "10.0.0.5", CMPI_chars);
    auto count = [](CMPIEnumeration* found) {
        int elements = 0;
        for (; found && CMHasNext(found, nullptr); ++elements)
            CMGetNext(found, nullptr);
        return elements;
    };
    CMPIContext* ctx = context.cmpi();
    EXPECT_EQ(3, count(broker->bft->associators(broker, ctx, path, nullptr, nullptr, nullptr, nullptr,
                                                nullptr, nullptr)));
    EXPECT_EQ(3, count(broker->bft->associatorNames(broker, ctx, path, nullptr, nullptr, nullptr, nullptr,
                                                    nullptr)));
    EXPECT_EQ(5, count(broker->bft->references(broker, ctx, path, nullptr, nullptr, nullptr, nullptr)));
    EXPECT_EQ(5, count(broker->bft->referenceNames(broker, ctx, path, nullptr, nullptr, nullptr)));
    EXPECT_EQ(2, count(broker->bft->referenceNames(broker, ctx, path, "TOY_Scope", nullptr, nullptr)));
}

} // namespace
} // namespace KPRV::broker
