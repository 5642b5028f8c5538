#include "tests/broker/Toy_Server.h"

#include "contracts/cmpi/cmpimacs.h"

namespace KPRV::broker {
namespace {

TEST(Registration_Catalogue, ReadsClassesOutOfTheModule)
{
    auto server = open_toy(TOY_DESCRIBED);
    const Class_Catalogue& catalogue = server->catalogue();
    EXPECT_EQ("toy", catalogue.module_name());
    EXPECT_EQ(2u, catalogue.class_names().size());
    const Class_Info* info = catalogue.find("toy_ITEM");
    ASSERT_TRUE(info);
    EXPECT_EQ("TOY_Base", info->superclass);
    EXPECT_TRUE(info->has_provider);
    EXPECT_FALSE(catalogue.find("TOY_Base")->has_provider);
    EXPECT_TRUE(info->property("id")->key);
    EXPECT_EQ(CMPI_uint16A, info->property("Numbers")->type);
    EXPECT_EQ(CMPI_ref, info->property("Other")->type);
    EXPECT_EQ(nullptr, info->property("Echo"));
    EXPECT_EQ(nullptr, catalogue.find("TOY_None"));
    EXPECT_TRUE(catalogue.is_a("TOY_Item", "toy_base"));
    EXPECT_FALSE(catalogue.is_a("TOY_Base", "TOY_Item"));
}

TEST(Registration_Catalogue, Defaults)
{
    auto server = open_toy(TOY_DESCRIBED);
    const Class_Info* info = server->catalogue().find("TOY_Item");
    EXPECT_EQ(Plain_Value::boolean(true), info->property("Flag")->default_value);
    EXPECT_EQ(Plain_Value::null_of(CMPI_uint8), info->property("U8")->default_value);
    ASSERT_EQ(2u, info->property("Numbers")->default_value.elements().size());
    EXPECT_EQ(7u, info->property("Numbers")->default_value.elements()[1].as_uint());
}

TEST(Registration_Catalogue, Methods)
{
    auto server = open_toy(TOY_DESCRIBED);
    const Method_Info* method = server->catalogue().find("TOY_Item")->method("echo");
    ASSERT_TRUE(method);
    EXPECT_TRUE(method->is_static);
    EXPECT_EQ(CMPI_uint32, method->return_type);
    ASSERT_EQ(1u, method->parameters.size());
    EXPECT_TRUE(method->parameter("text")->in && method->parameter("text")->out);
}

TEST(No_Catalogue, KnowsNothing)
{
    auto server = open_toy(TOY_PLAIN);
    EXPECT_FALSE(server->catalogue().is_known());
    EXPECT_TRUE(server->catalogue().is_a("A", "a"));
    EXPECT_FALSE(server->catalogue().is_a("A", "B"));
}

TEST(Described_Classes, CatchWrongPropertiesAndKeys)
{
    auto server = open_toy(TOY_DESCRIBED);
    const CMPIBroker* broker = server->broker().cmpi();
    Argument<Context_Object> context(*server->broker().core());
    Call_Frame frame(server->broker().core(), context.cmpi());
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/toy", "TOY_Item", nullptr);
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    CMPIUint64 number = 1;
    EXPECT_EQ(CMPI_RC_OK, CMAddKey(path, "Id", &number, CMPI_uint64).rc);
    EXPECT_EQ(CMPI_RC_ERR_INVALID_DATA_TYPE, CMAddKey(path, "Id", &number, CMPI_sint64).rc);
    EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER, CMAddKey(path, "U8", &number, CMPI_uint8).rc);
    EXPECT_EQ(CMPI_RC_ERR_INVALID_DATA_TYPE, CMSetProperty(instance, "U8", &number, CMPI_uint64).rc);
    // As servers do it: the property vanishes, and nobody is told.
    EXPECT_EQ(CMPI_RC_OK, CMSetProperty(instance, "None", &number, CMPI_uint64).rc);
    EXPECT_EQ(0u, CMGetPropertyCount(instance, nullptr));
    EXPECT_EQ("CMAddKey: TOY_Item.Id is uint32, not sint64\n"
              "CMAddKey: TOY_Item has no key U8\n"
              "CMSetProperty: TOY_Item.U8 is uint8, not uint64\n"
              "CMSetProperty: TOY_Item has no property None\n",
              server->violations().text());
}

} // namespace
} // namespace KPRV::broker
