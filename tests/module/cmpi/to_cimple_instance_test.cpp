#include "module/cmpi/to_cimple_instance.h"
#include "module/runtime/objects/Ref.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;

namespace {

class To_Cimple_Instance : public testing::Test
{
protected:
    template <class Object>
    Ref<Instance> convert(const Object* object)
    {
        return Ref<Instance>(
            _to_cimple_instance(&sample_repository, server.broker.cmpi(), NAME_SPACE, object));
    }
    CMPIObjectPath* path(const broker::Path_Value& x)
    {
        return broker::make_object<broker::Path_Object>(*server.core, "test", x)->cmpi();
    }
    CMPIInstance* instance(const broker::Instance_Value& x)
    {
        return broker::make_object<broker::Instance_Object>(*server.core, "test", x)->cmpi();
    }

    Test_Server server;
    broker::Mi_Frame frame{server.broker, {}};
    const broker::Path_Value element = path_of("Sample_Element", "e");
};

} // namespace

TEST_F(To_Cimple_Instance, APathGivesTheKeysOnly)
{
    broker::Path_Value with_more = element;
    with_more.keys.push_back({"Caption", broker::Plain_Value::text("no key")});
    const Ref<Instance> result = convert(path(with_more));
    ASSERT_TRUE(result);
    EXPECT_EQ(name_of_sample(result.ptr()), "e");
    EXPECT_EQ(static_cast<Sample_Element*>(result.ptr())->Caption.null, 1);
}

TEST_F(To_Cimple_Instance, AnInstanceGivesEverything)
{
    const Ref<Instance> result =
        convert(instance({path_of("Sample_Group", "g"),
                          {{"Name", broker::Plain_Value::text("g")},
                           {"Leader", broker::Plain_Value::instance(
                                          {element, {{"Name", broker::Plain_Value::text("leader")}}})}}}));
    ASSERT_TRUE(result);
    auto* const group = static_cast<Sample_Group*>(result.ptr());
    EXPECT_EQ(group->Name.value, "g");
    EXPECT_EQ(name_of_sample(group->Leader), "leader");
}

TEST_F(To_Cimple_Instance, FailuresHaveTheirWords)
{
    const auto words = [&](auto* object, const char* failing_call) {
        Log_Capture capture;
        if (failing_call)
            server.core->calls.fail(failing_call, 1, CMPI_RC_ERR_FAILED);
        EXPECT_FALSE(convert(object));
        return capture.said();
    };
    EXPECT_EQ(words(static_cast<CMPIInstance*>(nullptr), nullptr), Texts{});
    EXPECT_EQ(words(static_cast<CMPIObjectPath*>(nullptr), nullptr), Texts{"WARN null instance"});
    EXPECT_EQ(words(instance({element, {}}), "CMGetObjectPath"), Texts{"WARN CMGetObjectPath() failed"});
    EXPECT_EQ(words(instance({element, {}}), "CMGetClassName"), Texts{"WARN CMGetClassName() failed"});
    EXPECT_EQ(words(path(element), "CMGetClassName"), Texts{"WARN CMGetClassName() failed"});
    EXPECT_EQ(words(path(element), "CMGetCharsPtr"), Texts{"WARN CMGetClassName() failed"});
    EXPECT_EQ(words(path(class_path("Foreign")), nullptr), Texts{"WARN failed to find meta class: Foreign"});
    EXPECT_EQ(words(instance({class_path("Foreign"), {}}), nullptr),
              Texts{"WARN failed to find meta class: Foreign"});
}
