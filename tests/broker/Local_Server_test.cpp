#include "tests/broker/Toy_Server.h"

#include <dlfcn.h>
#include <thread>

namespace KPRV::broker {
namespace {

using Host_Test = Toy_Test;

TEST_F(Host_Test, EnumeratesEveryTypeAndArray)
{
    Result result = server->enumerate_instances("TOY_Item");
    ASSERT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_TRUE(result.done);
    EXPECT_EQ(1u, result.done_count);
    ASSERT_EQ(2u, result.instances.size());
    const Instance_Value& one = result.instances[0];
    EXPECT_EQ("root/toy", one.path.name_space);
    EXPECT_EQ(1u, one.path.key("id")->as_uint());
    EXPECT_EQ(Plain_Value::boolean(true), *one.property("Flag"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint8, 200), *one.property("U8"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint16, 60000), *one.property("U16"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint32, 4000000000u), *one.property("U32"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint64, 18000000000000000000u), *one.property("U64"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint8, -100), *one.property("S8"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint16, -30000), *one.property("S16"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint32, -2000000000), *one.property("S32"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint64, -9000000000000000000), *one.property("S64"));
    EXPECT_EQ(Plain_Value::real(CMPI_real32, 1.5), *one.property("R32"));
    EXPECT_EQ(Plain_Value::real(CMPI_real64, -0.25), *one.property("R64"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_char16, 'x'), *one.property("C16"));
    EXPECT_EQ(Plain_Value::null_of(CMPI_string), *one.property("Nothing"));
    EXPECT_EQ(Plain_Value::datetime("20260102030405.000006+060"), *one.property("When"));
    EXPECT_EQ(Plain_Value::array(CMPI_uint16, {Plain_Value::unsigned_number(CMPI_uint16, 0),
                                               Plain_Value::unsigned_number(CMPI_uint16, 1),
                                               Plain_Value::unsigned_number(CMPI_uint16, 2)}),
              *one.property("Numbers"));
    // An element that was never set is null.
    EXPECT_EQ(Plain_Value::array(CMPI_string,
                                 {Plain_Value::text("line\nbreak"), Plain_Value::null_of(CMPI_string)}),
              *one.property("Texts"));
    EXPECT_EQ(Plain_Value::array(CMPI_boolean, {}), *one.property("Empty"));
    EXPECT_EQ("TOY_Item", one.property("Other")->as_path()->class_name);
}

TEST_F(Host_Test, EnumeratingASuperclassAsksItsSubclasses)
{
    Result result = server->enumerate_instance_names("toy_base");
    ASSERT_EQ(CMPI_RC_OK, result.rc);
    ASSERT_EQ(2u, result.paths.size());
    EXPECT_EQ("TOY_Item", result.paths[1].class_name);
}

TEST_F(Host_Test, UnknownClassesAndUnservedOnes)
{
    EXPECT_EQ(CMPI_RC_ERR_INVALID_CLASS, server->enumerate_instances("TOY_None").rc);
    // TOY_Base is known, but it has no provider of its own.
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->get_instance({.class_name = "TOY_Base"}).rc);
}

TEST_F(Host_Test, AFactoryThatFailsSaysWhy)
{
    // It answers an interface and a failure.
    Result result = server->enumerate_instances("TOY_Broken");
    EXPECT_EQ(CMPI_RC_ERR_FAILED, result.rc);
    EXPECT_EQ("out of order", result.message);
}

TEST_F(Host_Test, GetsByKeyWithBothKeyStyles)
{
    EXPECT_EQ(2u, server->get_instance(item(2)).instances.at(0).property("Id")->as_uint());
    server = open_toy(TOY_DESCRIBED, Server_Options::pegasus_like());
    EXPECT_EQ(2u, server->get_instance(item(2)).instances.at(0).property("Id")->as_uint());
}

TEST_F(Host_Test, StatusMessageComesBack)
{
    Result result = server->get_instance(item(3));
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, result.rc);
    EXPECT_EQ("no such item", result.message);
    EXPECT_FALSE(result.done);
}

TEST_F(Host_Test, LateFilterKeepsThePath)
{
    Result result = server->enumerate_instances("TOY_Item", Property_List({"u8"}));
    ASSERT_EQ(2u, result.instances.size());
    EXPECT_EQ(1u, result.instances[0].properties.size());
    EXPECT_EQ(2u, result.instances[0].path.keys.size());
}

TEST_F(Host_Test, EarlyFilterLosesKeysThatTheListLeavesOut)
{
    server = open_toy(TOY_DESCRIBED, Server_Options::sfcb_like());
    Result result = server->enumerate_instances("TOY_Item", Property_List({"U8", "Id"}));
    ASSERT_EQ(2u, result.instances.size());
    EXPECT_EQ(2u, result.instances[0].properties.size());
    ASSERT_EQ(1u, result.instances[0].path.keys.size());
    EXPECT_EQ("Id", result.instances[0].path.keys[0].name);
}

TEST_F(Host_Test, CreatesModifiesAndDeletes)
{
    Instance_Value instance = {.path = item(1), .properties = {{"Flag", Plain_Value::boolean(false)}}};
    Result created = server->create_instance(instance);
    ASSERT_EQ(CMPI_RC_OK, created.rc);
    EXPECT_TRUE(same_object(item(1), created.paths.at(0)));
    EXPECT_EQ(CMPI_RC_OK, server->modify_instance(instance, Property_List({"Name"})).rc);
    EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER, server->modify_instance(instance).rc);
    EXPECT_EQ(CMPI_RC_OK, server->delete_instance(item(1)).rc);
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, server->delete_instance(item(7)).rc);
}

TEST_F(Host_Test, CreateGetsKeysAndDefaultsOfTheClass)
{
    server->calls().record(true);
    server->create_instance({.path = item(1)});
    // 20 properties; the method is none.
    EXPECT_EQ(20u, server->calls().calls("CMGetPropertyAt").size());
}

TEST_F(Host_Test, EchoesEveryKindOfArgument)
{
    server = open_toy(TOY_PLAIN);
    std::vector<Named_Value> in = {
        {"Flag", Plain_Value::boolean(true)},
        {"Number", Plain_Value::signed_number(CMPI_sint16, -5)},
        {"Text", Plain_Value::text("t")},
        {"When", Plain_Value::datetime("00000001020304.000005:000")},
        {"Ref", Plain_Value::path(item(1))},
        {"Inst",
         Plain_Value::instance(
             {.path = item(2), .properties = {{"Id", Plain_Value::unsigned_number(CMPI_uint32, 2)}}})},
        {"Refs", Plain_Value::array(CMPI_ref, {Plain_Value::path(item(1)), Plain_Value::path(item(2))})},
        {"Reals", Plain_Value::array(CMPI_real64, {Plain_Value::real(CMPI_real64, 0.5)})},
    };
    Result result = call(*server, "Echo", in);
    ASSERT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint32, 8), result.return_value);
    EXPECT_EQ(in, result.out);
}

TEST_F(Host_Test, ArgumentsWithoutValue)
{
    std::vector<Named_Value> in = {{"Text", Plain_Value::null_of(CMPI_string)}};
    EXPECT_EQ(0u, call(*server, "Echo", in).return_value.as_uint());
    server = open_toy(TOY_PLAIN, Server_Options::pegasus_like());
    Result result = call(*server, "Echo", in);
    EXPECT_EQ(1u, result.return_value.as_uint());
    EXPECT_EQ(Plain_Value::null_of(CMPI_boolean), result.out.at(0).value);
}

TEST_F(Host_Test, EmbeddedInstancesAndReferencesComeOut)
{
    server = open_toy(TOY_PLAIN);
    Result result = call(*server, "Embed");
    ASSERT_EQ(4u, result.out.size());
    EXPECT_EQ("k", find_value(result.out, "Part")->as_instance()->property("Key")->as_text());
    EXPECT_EQ("k", find_value(result.out, "Ref")->as_path()->key("Key")->as_text());
    EXPECT_EQ(1u, find_value(result.out, "Parts")->elements().size());
    EXPECT_EQ(CMPI_refA, find_value(result.out, "Refs")->type);
}

TEST_F(Host_Test, ThePrincipalHasThreeStates)
{
    server = open_toy(TOY_PLAIN);
    EXPECT_EQ(unsigned(CMPI_RC_ERR_NO_SUCH_PROPERTY), call(*server, "User").return_value.as_uint());
    server = open_toy(TOY_PLAIN, {.user = "root"});
    EXPECT_EQ("root", find_value(call(*server, "User").out, "User")->as_text());
    server = open_toy(TOY_PLAIN, {.user_without_text = true});
    Result result = call(*server, "User");
    EXPECT_EQ(0u, result.return_value.as_uint());
    EXPECT_TRUE(result.out.empty());
}

TEST_F(Host_Test, AMethodMayReturnNull)
{
    Result result = call(*server, "Nothing");
    EXPECT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_TRUE(result.return_value.null);
    EXPECT_EQ(CMPI_null, result.return_value.type);
}

TEST_F(Host_Test, TypesOfObjects)
{
    server = open_toy(TOY_PLAIN);
    Result result = call(*server, "ObjectTypes");
    EXPECT_EQ("CMPIObjectPath", result.out.at(0).value.as_text());
    EXPECT_EQ(1u, result.return_value.as_uint());
}

TEST_F(Host_Test, AssociationCallsOfOneProvider)
{
    EXPECT_EQ(1u, server->associators("TOY_Link", item(1), {}).instances.size());
    EXPECT_EQ(1u, server->associator_names("TOY_Link", item(1), {}).paths.size());
    EXPECT_EQ(1u, server->references("TOY_Link", item(1), {}).instances.size());
    Result result = server->reference_names("TOY_Link", item(1), {});
    ASSERT_EQ(1u, result.paths.size());
    EXPECT_TRUE(same_object(item(1), *result.paths[0].key("Antecedent")->as_path()));
    EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER,
              server->associators("TOY_Link", item(1), {.role = "Antecedent"}).rc);
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->associators("TOY_Item", item(1), {}).rc);
}

TEST_F(Host_Test, IndicationsReachTheSink)
{
    std::string seen;
    server->set_sink([&](const std::string& name_space, const Instance_Value& alert) {
        seen = name_space + " " + alert.property("Text")->as_text();
        return CMPI_RC_OK;
    });
    EXPECT_EQ(CMPI_RC_OK, server->authorize_filter("TOY_Alert", "root/toy"));
    EXPECT_EQ(CMPI_RC_OK, server->must_poll("TOY_Alert", "root/toy"));
    EXPECT_EQ(CMPI_RC_OK, server->activate_filter("TOY_Alert", "root/toy"));
    EXPECT_EQ(CMPI_RC_OK, server->enable_indications("TOY_Alert"));
    EXPECT_EQ("root/toy smoke", seen);
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications("TOY_Alert"));
    EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter("TOY_Alert", "root/toy"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->enable_indications("TOY_Item"));
}

TEST_F(Host_Test, AnIndicationTableMayHaveNullSlots)
{
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->authorize_filter("TOY_Silent", "root/toy"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->must_poll("TOY_Silent", "root/toy"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->activate_filter("TOY_Silent", "root/toy"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->deactivate_filter("TOY_Silent", "root/toy"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->enable_indications("TOY_Silent"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->disable_indications("TOY_Silent"));
}

TEST_F(Host_Test, AnAttachedThreadFreesItsObjects)
{
    EXPECT_EQ(CMPI_RC_OK, call(*server, "Worker").rc);
    for (const Ledger::Entry& entry : server->ledger().entries())
        if (entry.maker == "CMNewString") {
            EXPECT_EQ(2u, entry.made);
            EXPECT_EQ(1u, entry.released);
            EXPECT_EQ(1u, entry.freed_by_frame);
        }
}

TEST_F(Host_Test, TheLedgerTellsWhatWasLeftToTheServer)
{
    server->enumerate_instances("TOY_Item");
    for (const Ledger::Entry& entry : server->ledger().entries()) {
        if (entry.kind == Object_Kind::INSTANCE) {
            EXPECT_EQ(2u, entry.released);
        } else {
            EXPECT_EQ(entry.made, entry.freed_by_frame);
        }
    }
}

TEST_F(Host_Test, ManyThreadsAtOnce)
{
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i)
        threads.emplace_back([&] {
            for (int round = 0; round < 20; ++round) {
                EXPECT_EQ(2u, server->enumerate_instances("TOY_Item").instances.size());
                EXPECT_EQ(1u, server->get_instance(item(1)).instances.size());
            }
        });
    for (std::thread& thread : threads)
        thread.join();
}

TEST_F(Host_Test, CleanupKeepsWhatAsksToStay)
{
    server->enumerate_instances("TOY_Item");
    call(*server, "Nothing");
    EXPECT_EQ(2u, server->providers().count());
    EXPECT_EQ(CMPI_RC_DO_NOT_UNLOAD, server->unload(false));
    EXPECT_EQ(1u, server->providers().count());
    EXPECT_EQ(CMPI_RC_OK, server->unload("TOY_Item", true));
    EXPECT_EQ(0u, server->providers().count());
    EXPECT_EQ(2u, server->enumerate_instances("TOY_Item").instances.size());
}

TEST(Local_Server, TheLibraryIsUnmappedAtTheEnd)
{
    {
        auto server = open_toy(TOY_PLAIN);
        server->enumerate_instances("TOY_Item");
    }
    EXPECT_EQ(nullptr, dlopen(TOY_PLAIN, RTLD_NOW | RTLD_NOLOAD));
}

TEST(Local_Server, ALibraryThatCannotBeOpenedHasAReason)
{
    std::string error;
    EXPECT_EQ(nullptr, Local_Server::open("/nowhere/lib.so", {}, error));
    EXPECT_NE(std::string::npos, error.find("/nowhere/lib.so"));
}

} // namespace
} // namespace KPRV::broker
