#include "module/cmpi/Converter.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

#include <cmpimacs.h>

using namespace KPRV;

namespace {

class Converter : public testing::Test
{
protected:
    const CMPIBroker* broker() { return server.broker.cmpi(); }
    broker::Path_Object* path(const broker::Path_Value& x, bool from_client = false)
    {
        return broker::make_object<broker::Path_Object>(*server.core, "test", x, from_client);
    }
    broker::Instance_Object* instance(const broker::Instance_Value& x)
    {
        return broker::make_object<broker::Instance_Object>(*server.core, "test", x);
    }
    const broker::Path_Value& content(const CMPIObjectPath* x)
    {
        return static_cast<broker::Path_Object*>(broker::find_object(x))->content;
    }
    const broker::Instance_Value& content(const CMPIInstance* x)
    {
        return static_cast<broker::Instance_Object*>(broker::find_object(x))->content;
    }

    Test_Server server;
    broker::Mi_Frame frame{server.broker, {}};
};

} // namespace

// --- to the server

TEST_F(Converter, ObjectPathHasEveryKeyWithAValue)
{
    const Ref<Instance> port(make_port("p", 7));
    CMPIObjectPath* result = nullptr;
    ASSERT_EQ(make_cmpi_object_path(broker(), port.ptr(), NAME_SPACE, result), CMPI_RC_OK);
    EXPECT_EQ(content(result).class_name, "Sample_Port");
    EXPECT_EQ(content(result).name_space, NAME_SPACE);
    EXPECT_EQ(content(result).keys.size(), 2u);
    EXPECT_EQ(*content(result).key("Number"), broker::Plain_Value::unsigned_number(CMPI_uint64, 7));

    static_cast<Sample_Port*>(port.ptr())->Name.null = 1;
    ASSERT_EQ(make_cmpi_object_path(broker(), port.ptr(), NAME_SPACE, result), CMPI_RC_OK);
    EXPECT_EQ(content(result).keys.size(), 1u);
}

TEST_F(Converter, AFailingKeyIsLeftOutOfThePath)
{
    const Ref<Instance> port(make_port("p", 7));
    server.core->calls.fail("CMAddKey", 1, CMPI_RC_ERR_FAILED);
    CMPIObjectPath* result = nullptr;
    EXPECT_EQ(make_cmpi_object_path(broker(), port.ptr(), NAME_SPACE, result), CMPI_RC_OK);
    EXPECT_EQ(content(result).keys.size(), 1u);
}

TEST_F(Converter, APathThatTheServerDoesNotMake)
{
    const Ref<Instance> port(make_port("p", 7));
    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_NOT_FOUND);
    CMPIObjectPath* result = reinterpret_cast<CMPIObjectPath*>(this);
    EXPECT_EQ(make_cmpi_object_path(broker(), port.ptr(), NAME_SPACE, result), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(result, nullptr);
}

TEST_F(Converter, EveryTypeGoesToTheServerAndComesBack)
{
    const Ref<Instance> sample(create<Sample_Types>(false));
    auto* const types = static_cast<Sample_Types*>(sample.ptr());
    types->Id.set("id");
#define SET(TYPE, CODE, ONE)                                                                                 \
    types->Scalar_##CODE.set(ONE);                                                                           \
    types->Array_##CODE.value.append(ONE);                                                                   \
    types->Array_##CODE.value.append(TYPE());
    SET(boolean, BOOLEAN, true)
    SET(uint8, UINT8, 200)
    SET(sint8, SINT8, -100)
    SET(uint16, UINT16, 60000)
    SET(sint16, SINT16, -30000)
    SET(uint32, UINT32, 4000000000u)
    SET(sint32, SINT32, -2000000000)
    SET(uint64, UINT64, 18000000000000000000u)
    SET(sint64, SINT64, -9000000000000000000)
    SET(real32, REAL32, 1.5f)
    SET(real64, REAL64, -2.5)
    SET(char16, CHAR16, u'x')
    SET(String, STRING, "text")
    SET(Datetime, DATETIME, Datetime(Datetime::DAY))
#undef SET
    CMPIObjectPath* cop = nullptr;
    CMPIInstance* ci = nullptr;
    ASSERT_EQ(make_cmpi_object_path(broker(), types, NAME_SPACE, cop), CMPI_RC_OK);
    ASSERT_EQ(make_cmpi_instance(broker(), types, NAME_SPACE, cop, nullptr, ci), CMPI_RC_OK);
    EXPECT_EQ(content(ci).properties.size(), 29u);
    Ref<Instance> back;
    ASSERT_EQ(make_cimple_instance(broker(), &Sample_Types::static_meta_class, cop, ci, back), CMPI_RC_OK);
    __set_name_space_recursive(types, NAME_SPACE, true);
    EXPECT_TRUE(identical(types, back.ptr()));
}

TEST_F(Converter, InstanceWithoutAPathBuildsOneAndSaysSo)
{
    Log_Capture capture;
    const Ref<Instance> port(make_port("p", 7));
    CMPIInstance* ci = nullptr;
    ASSERT_EQ(make_cmpi_instance(broker(), port.ptr(), NAME_SPACE, nullptr, nullptr, ci), CMPI_RC_OK);
    EXPECT_EQ(content(ci).path.keys.size(), 2u);
    EXPECT_EQ(capture.said(), Texts{"WARN No ObjectPath built before call to make_CMPI_instance"});

    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(make_cmpi_instance(broker(), port.ptr(), NAME_SPACE, nullptr, nullptr, ci), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(ci, nullptr);
}

TEST_F(Converter, InstanceTakesThePropertyList)
{
    const Ref<Instance> port(make_port("p", 7));
    CMPIInstance* ci = nullptr;
    CMPIObjectPath* const cop = path(class_path("Sample_Port"))->cmpi();
    server.core->calls.record(true);
    ASSERT_EQ(make_cmpi_instance(broker(), port.ptr(), NAME_SPACE, cop, Property_List{"Number"}, ci),
              CMPI_RC_OK);
    EXPECT_EQ(server.calls()[1], "CMSetPropertyFilter") << "before the properties";
    server.core->calls.fail("CMSetPropertyFilter", 1, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(make_cmpi_instance(broker(), port.ptr(), NAME_SPACE, cop, Property_List{"Number"}, ci),
              CMPI_RC_ERR_ACCESS_DENIED)
        << "its own code";
    server.core->calls.fail("CMNewInstance", 1, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(make_cmpi_instance(broker(), port.ptr(), NAME_SPACE, cop, nullptr, ci), CMPI_RC_ERR_FAILED);
}

TEST_F(Converter, AFailingPropertyIsLeftOutOfTheInstance)
{
    Log_Capture capture;
    const Ref<Instance> other(create<Sample_Other>(false));
    server.core->calls.fail("CMSetProperty", 1, CMPI_RC_ERR_FAILED);
    CMPIInstance* ci = nullptr;
    EXPECT_EQ(make_cmpi_instance(broker(), other.ptr(), NAME_SPACE, path(class_path("Sample_Other"))->cmpi(),
                                 nullptr, ci),
              CMPI_RC_OK);
    EXPECT_EQ(content(ci).properties.size(), 1u);
    EXPECT_EQ(capture.said(),
              (Texts{"WARN CMSetProperty() failed: Size", "WARN conversion error: Sample_Other.Size"}));
}

TEST_F(Converter, ReferencesGoByNameUnlessTheyAreEmbedded)
{
    const Ref<Instance> thing(create<Thing>(true));
    static_cast<Thing*>(thing.ptr())->Friend = make_named("f");
    static_cast<Thing*>(thing.ptr())->Friends.value.append(make_port("g", 1));
    static_cast<Thing*>(thing.ptr())->Friends.null = 0;
    CMPIInstance* ci = nullptr;
    ASSERT_EQ(
        make_cmpi_instance(broker(), thing.ptr(), NAME_SPACE, path(class_path("Thing"))->cmpi(), nullptr, ci),
        CMPI_RC_OK);
    EXPECT_EQ(content(ci).property("Friend")->type, CMPI_ref);
    EXPECT_EQ(content(ci).property("Friends")->type, CMPI_refA);

    const Ref<Instance> group(create<Sample_Group>(true));
    static_cast<Sample_Group*>(group.ptr())->Leader = make_named("l");
    ASSERT_EQ(make_cmpi_instance(broker(), group.ptr(), NAME_SPACE, path(class_path("Sample_Group"))->cmpi(),
                                 nullptr, ci),
              CMPI_RC_OK);
    EXPECT_EQ(content(ci).property("Leader")->type, CMPI_instance);
}

TEST_F(Converter, MethodGivesOutParametersAndTheReturnValueApart)
{
    const Ref<Instance> record(create(&Sample_Element_Reset_method::static_meta_class));
    auto* const reset = static_cast<Sample_Element_Reset_method*>(record.ptr());
    __set_null_flags(reset, true, true, 1);
    reset->Force.set(true);
    reset->Count.set(3);
    reset->return_value.set(4);
    auto* const out = broker::make_object<broker::Args_Object>(*server.core, "test");
    CMPIValue value = {};
    CMPIType type = 99;
    ASSERT_EQ(make_cmpi_method(broker(), NAME_SPACE, reset, out->cmpi(), value, type), CMPI_RC_OK);
    EXPECT_EQ(out->content.size(), 1u);
    EXPECT_EQ(type, CMPI_uint32);
    EXPECT_EQ(value.uint32, 4u);

    reset->return_value.null = 1;
    ASSERT_EQ(make_cmpi_method(broker(), NAME_SPACE, reset, out->cmpi(), value, type), CMPI_RC_OK);
    EXPECT_EQ(type, 0);
    EXPECT_EQ(value.uint64, 0u);
}

// --- from the server

TEST_F(Converter, ReferenceTakesTheKeysNarrowed)
{
    broker::Path_Value cop = class_path("Thing");
    cop.keys = {{"Small", broker::Plain_Value::unsigned_number(CMPI_uint16, 65535)},
                {"Signed", broker::Plain_Value::unsigned_number(CMPI_uint32, 5)},
                {"Word", broker::Plain_Value::unsigned_number(CMPI_uint32, 6)},
                {"When", broker::Plain_Value::datetime("00000000000001.000000:000")}};
    Ref<Instance> result;
    ASSERT_EQ(make_cimple_reference(nullptr, &Thing::static_meta_class, path(cop, true)->cmpi(), result),
              CMPI_RC_OK);
    const auto* const thing = static_cast<Thing*>(result.ptr());
    EXPECT_EQ(thing->Small.value, 65535);
    EXPECT_EQ(thing->Signed.value, 5);
    EXPECT_EQ(thing->Word.value, 6u);
    EXPECT_EQ(thing->When.value, Datetime(Datetime::SEC));
    EXPECT_EQ(thing->__name_space, NAME_SPACE);
    EXPECT_EQ(thing->Friends.null, 0) << "references have no part in the null flags";
}

TEST_F(Converter, ReferenceIgnoresWhatIsNoKey)
{
    Log_Capture capture;
    broker::Path_Value cop = path_of("Sample_Element", "e");
    cop.keys.push_back({"Caption", broker::Plain_Value::text("no key")});
    cop.keys.push_back({"Unknown", broker::Plain_Value::text("nothing")});
    Ref<Instance> result;
    ASSERT_EQ(make_cimple_reference(nullptr, &Sample_Element::static_meta_class, path(cop)->cmpi(), result),
              CMPI_RC_OK);
    EXPECT_EQ(static_cast<Sample_Element*>(result.ptr())->Caption.null, 1);
    EXPECT_EQ(capture.said(), Texts{"WARN unknown feature: Sample_Element.Unknown"});
}

TEST_F(Converter, IntegerKeysOfAServerThatSignsThemFitUint32Only)
{
    Test_Server signing(broker::Server_Options::pegasus_like());
    broker::Mi_Frame signing_frame(signing.broker, {});
    broker::Path_Value cop = class_path("Thing");
    cop.keys = {{"Small", broker::Plain_Value::unsigned_number(CMPI_uint16, 5)},
                {"Word", broker::Plain_Value::unsigned_number(CMPI_uint32, 6)}};
    Ref<Instance> result;
    auto* const object = broker::make_object<broker::Path_Object>(*signing.core, "test", cop, true);
    ASSERT_EQ(make_cimple_reference(nullptr, &Thing::static_meta_class, object->cmpi(), result), CMPI_RC_OK);
    EXPECT_EQ(static_cast<Thing*>(result.ptr())->Small.null, 1);
    EXPECT_EQ(static_cast<Thing*>(result.ptr())->Word.value, 6u);
    EXPECT_EQ(static_cast<Thing*>(result.ptr())->Word.null, 0);
}

TEST_F(Converter, AnAbsentPathOrNameSpace)
{
    Ref<Instance> result(make_named("old"));
    EXPECT_EQ(make_cimple_reference(nullptr, &Sample_Element::static_meta_class, nullptr, result),
              CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(result);
    server.core->calls.fail("CMGetNameSpace", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(make_cimple_reference(nullptr, &Sample_Element::static_meta_class,
                                    path(path_of("Sample_Element", "e"))->cmpi(), result),
              CMPI_RC_OK);
    EXPECT_EQ(result->__name_space, "");
}

TEST_F(Converter, NestedInstancesKeepTheirNameSpaceOrTakeThatOfTheCall)
{
    // What the name space of an embedded instance was is lost on the way in: it gets that of the path.
    Ref<Instance> result;
    ASSERT_EQ(make_cimple_instance(
                  broker(), &Sample_Group::static_meta_class, path(class_path("Sample_Group"))->cmpi(),
                  instance({class_path("Sample_Group"),
                            {{"Leader",
                              broker::Plain_Value::instance({path_of("Sample_Element", "l"),
                                                             {{"Name", broker::Plain_Value::text("l")}}})}}})
                      ->cmpi(),
                  result),
              CMPI_RC_OK);
    EXPECT_EQ(static_cast<Sample_Group*>(result.ptr())->Leader->__name_space, NAME_SPACE);

    const Ref<Instance> thing(create<Thing>(true));
    Sample_Element* const friend_element = make_named("f");
    friend_element->__name_space = "root/own";
    static_cast<Thing*>(thing.ptr())->Friend = friend_element;
    CMPIInstance* ci = nullptr;
    ASSERT_EQ(
        make_cmpi_instance(broker(), thing.ptr(), NAME_SPACE, path(class_path("Thing"))->cmpi(), nullptr, ci),
        CMPI_RC_OK);
    EXPECT_EQ(content(ci).property("Friend")->as_path()->name_space, "root/own");
}

TEST_F(Converter, InstanceLeavesOutWhatDoesNotFit)
{
    Log_Capture capture;
    Ref<Instance> result;
    const std::vector<broker::Plain_Value> elements = {broker::Plain_Value::null_of(CMPI_uint32)};
    ASSERT_EQ(make_cimple_instance(broker(), &Sample_Element::static_meta_class,
                                   path(class_path("Sample_Element"))->cmpi(),
                                   instance({class_path("Sample_Element"),
                                             {{"Name", broker::Plain_Value::unsigned_number(CMPI_uint8, 1)},
                                              {"EnabledState", broker::Plain_Value::null_of(CMPI_uint16)},
                                              {"Codes", broker::Plain_Value::array(CMPI_uint32, elements)},
                                              {"Caption", broker::Plain_Value::text("kept")},
                                              {"Reset", broker::Plain_Value::text("a method")}}})
                                       ->cmpi(),
                                   result),
              CMPI_RC_OK);
    const auto* const element = static_cast<Sample_Element*>(result.ptr());
    EXPECT_EQ(element->Name.null, 1);
    EXPECT_EQ(element->EnabledState.null, 1);
    EXPECT_EQ(element->Codes.null, 1);
    EXPECT_EQ(element->Caption.value, "kept");
    EXPECT_EQ(
        capture.said(),
        (Texts{"WARN type mismatch on Name: uint8/string", "WARN conversion error: Sample_Element.Name",
               "WARN encountered null array element", "WARN cmpi_to_cimple_value() failed",
               "WARN conversion error: Sample_Element.Codes", "WARN unknown feature: Sample_Element.Reset"}));
}

TEST_F(Converter, MethodTakesInParametersOnly)
{
    Ref<Instance> record;
    auto* const in = broker::make_object<broker::Args_Object>(
        *server.core, "test",
        std::vector<broker::Named_Value>{{"force", broker::Plain_Value::boolean(true)},
                                         {"Message", broker::Plain_Value::text("out only")}});
    ASSERT_EQ(make_cimple_method(nullptr, &Sample_Element::static_meta_class,
                                 &Sample_Element_Reset_method::static_meta_class,
                                 path(class_path("Sample_Element"))->cmpi(), in->cmpi(), nullptr, record),
              CMPI_RC_OK);
    const auto* const reset = static_cast<Sample_Element_Reset_method*>(record.ptr());
    EXPECT_EQ(reset->__meta_class, as_class(&Sample_Element_Reset_method::static_meta_class));
    EXPECT_EQ(reset->Force.value, true);
    EXPECT_EQ(reset->Force.null, 0);
    EXPECT_EQ(reset->Message.null, 1);
    EXPECT_EQ(reset->return_value.null, 1);
    EXPECT_EQ(reset->__name_space, NAME_SPACE);
}

TEST_F(Converter, MethodSharesTheNameSpaceOfWhatItIsCalledOnIfItIsTheSame)
{
    const Ref<Instance> element(make_named<Sample_Element>("x"));
    for (const char* name_space : {NAME_SPACE, "root/other", ""}) {
        element->__name_space = name_space;
        Ref<Instance> record;
        broker::Args_Object* const in = broker::make_object<broker::Args_Object>(
            *server.core, "test", std::vector<broker::Named_Value>());
        ASSERT_EQ(make_cimple_method(nullptr, &Sample_Element::static_meta_class,
                                     &Sample_Element_Reset_method::static_meta_class,
                                     path(class_path("Sample_Element"))->cmpi(), in->cmpi(), nullptr, record,
                                     element.ptr()),
                  CMPI_RC_OK);
        EXPECT_EQ(record->__name_space, NAME_SPACE);
        EXPECT_EQ(record->__name_space.c_str() == element->__name_space.c_str(),
                  element->__name_space == NAME_SPACE);
    }
}
