#include "tests/module/cmpi/Test_Server.h"

using namespace KPRV;
using broker::Result;

namespace {

/// An element with its key and nothing else.
Sample_Element* bare_element(const char* name)
{
    Sample_Element* const element = create<Sample_Element>(false);
    __set_null_flags(element, true, true, 1);
    element->Name.set(name);
    return element;
}

class Instance_Operations : public testing::Test
{
protected:
    Instance_Operations()
    {
        provider.factory('I');
        script.calls.clear();
    }
    ~Instance_Operations() override { provider.cleanup('I'); }

    CMPIInstanceMI* mi() { return &provider.data().instance_mi; }

    Result enumerate(const broker::Path_Value& path, const char** properties = nullptr)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->enumerateInstances(mi(), context, result, cop, properties);
        });
    }
    Result enumerate_names(const broker::Path_Value& path)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->enumerateInstanceNames(mi(), context, result, cop);
        });
    }
    Result get(const broker::Path_Value& path, const char** properties = nullptr)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->getInstance(mi(), context, result, cop, properties);
        });
    }
    Result create_instance(const broker::Path_Value& path, const broker::Instance_Value& instance)
    {
        const broker::Argument<broker::Instance_Object> ci(*server.core, instance);
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->createInstance(mi(), context, result, cop, ci.cmpi());
        });
    }
    Result modify(const broker::Path_Value& path, const broker::Instance_Value& instance,
                  const char** properties = nullptr)
    {
        const broker::Argument<broker::Instance_Object> ci(*server.core, instance);
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->modifyInstance(mi(), context, result, cop, ci.cmpi(), properties);
        });
    }
    Result remove(const broker::Path_Value& path)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->deleteInstance(mi(), context, result, cop);
        });
    }

    Test_Server server;
    Served_Provider provider{server, element_registration};
    const broker::Path_Value a = path_of("Sample_Element", "a");
    const broker::Instance_Value a_off{
        a,
        {{"Name", broker::Plain_Value::text("a")},
         {"EnabledState", broker::Plain_Value::unsigned_number(CMPI_uint16, 3)}}};
};

/// "Name EnabledState Caption ...": 1 where the cell is null.
std::string null_bytes(const Instance* instance)
{
    const auto* const x = static_cast<const Sample_Element*>(instance);
    std::string text;
    for (const uint8 null : {x->Name.null, x->EnabledState.null, x->Caption.null, x->Timeout.null,
                             x->Codes.null, x->Words.null, x->Pauses.null})
        text += null ? '1' : '0';
    return text;
}

int deliver_a_and_b(const Instance*, const Script::Deliver& deliver)
{
    EXPECT_TRUE(deliver(bare_element("a")));
    EXPECT_TRUE(deliver(bare_element("b")));
    return 0;
}

/// Status, code, and whether the result is ended.
struct Row
{
    int status;
    int rc;
    unsigned done;
};

} // namespace

// --- enumerateInstances

TEST_F(Instance_Operations, EnumerationReturnsEachInstance)
{
    script.enum_instances = deliver_a_and_b;
    const Result result = enumerate(class_path("Sample_Element"));
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    ASSERT_EQ(result.instances.size(), 2u);
    EXPECT_EQ(result.instances[0].path.class_name, "Sample_Element");
    EXPECT_EQ(result.instances[0].path.name_space, NAME_SPACE);
    EXPECT_EQ(text_of_key(result.instances[1].path, "Name"), "b");
    EXPECT_EQ(result.instances[1].properties.size(), 1u) << "nulls never leave the instance";
    EXPECT_EQ(script.calls, Texts{"enum_instances"});
}

TEST_F(Instance_Operations, EnumerationMakesItsCallsInOrder)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(bare_element("a"));
        return 0;
    };
    server.core->calls.record(true);
    enumerate(class_path("Sample_Element"), Property_List{"Name"});
    EXPECT_EQ(server.calls(),
              (Texts{"CMGetClassName", "CMGetNameSpace", "CMGetKeyCount", "CMGetNameSpace",
                     "CMNewObjectPath Sample_Element", "CMNewString a", "CMAddKey Name", "CMNewInstance",
                     "CMSetPropertyFilter", "CMNewString a", "CMSetProperty Name", "CMReturnInstance",
                     "CMRelease instance", "CMReturnDone"}));
}

TEST_F(Instance_Operations, EnumerationModelHasTheKeysAndTheList)
{
    std::string seen;
    script.enum_instances = [&](const Instance* model, const Script::Deliver&) {
        seen = null_bytes(model);
        EXPECT_EQ(model->__name_space, NAME_SPACE);
        return 0;
    };
    enumerate(class_path("Sample_Element"));
    EXPECT_EQ(seen, "1111111") << "without a list the non-keys stay null";
    enumerate(a);
    EXPECT_EQ(seen, "0111111");
    enumerate(class_path("Sample_Element"), Property_List{"Caption", "words", "Unknown"});
    EXPECT_EQ(seen, "1101101");
    enumerate(class_path("Sample_Element"), Property_List{});
    EXPECT_EQ(seen, "1111111");
}

TEST_F(Instance_Operations, EnumerationServesAnyClassOfTheModule)
{
    const Meta_Class* seen = nullptr;
    script.enum_instances = [&](const Instance* model, const Script::Deliver&) {
        seen = model->__meta_class;
        return 0;
    };
    EXPECT_EQ(enumerate(class_path("sample_port")).rc, CMPI_RC_OK);
    EXPECT_EQ(seen, &Sample_Port::static_meta_class);
    EXPECT_EQ(enumerate(class_path("Sample_Other")).rc, CMPI_RC_OK);
    EXPECT_EQ(seen, &Sample_Other::static_meta_class);
}

TEST_F(Instance_Operations, StatusesOfEnumerations)
{
    const Row instances[] = {{0, 0, 1}, {70, 1, 0}, {71, 2, 0}, {72, 0, 1}, {-1, 0, 1}, {60, 0, 1}};
    const Row names[] = {{0, 0, 1}, {70, 1, 0}, {71, 2, 0}, {72, 0, 0}, {-1, 0, 0}, {60, 0, 0}};
    int status = 0;
    script.enum_instances = [&](const Instance*, const Script::Deliver&) { return status; };
    for (const Row& row : instances) {
        status = row.status;
        const Result result = enumerate(class_path("Sample_Element"));
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
    }
    for (const Row& row : names) {
        status = row.status;
        const Result result = enumerate_names(class_path("Sample_Element"));
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
    }
}

TEST_F(Instance_Operations, AFailedConversionCutsTheEnumerationShortWithoutAWord)
{
    Texts answers;
    script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) {
        for (const char* name : {"a", "b", "c"})
            answers.push_back(deliver(bare_element(name)) ? "taken" : "dropped");
        return 0;
    };
    server.core->calls.fail("CMNewInstance", 2, CMPI_RC_ERR_FAILED);
    const Result result = enumerate(class_path("Sample_Element"));
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    EXPECT_EQ(result.instances.size(), 1u);
    EXPECT_EQ(answers, (Texts{"taken", "dropped", "dropped"}));
}

TEST_F(Instance_Operations, AnObjectPathThatFailsIsTriedOnceMore)
{
    script.enum_instances = deliver_a_and_b;
    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(enumerate(class_path("Sample_Element")).instances.size(), 2u);
}

// --- enumerateInstanceNames

TEST_F(Instance_Operations, NamesAreReturnedAsPaths)
{
    script.enum_instances = deliver_a_and_b;
    server.core->calls.record(true);
    const Result result = enumerate_names(class_path("Sample_Element"));
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    ASSERT_EQ(result.paths.size(), 2u);
    EXPECT_EQ(text_of_key(result.paths[0], "Name"), "a");
    EXPECT_EQ(result.paths[0].name_space, NAME_SPACE);
    EXPECT_EQ(server.calls(),
              (Texts{"CMGetClassName", "CMGetNameSpace", "CMGetKeyCount", "CMGetNameSpace",
                     "CMNewObjectPath Sample_Element", "CMNewString a", "CMAddKey Name", "CMReturnObjectPath",
                     "CMRelease object path", "CMNewObjectPath Sample_Element", "CMNewString b",
                     "CMAddKey Name", "CMReturnObjectPath", "CMRelease object path", "CMReturnDone"}));
}

TEST_F(Instance_Operations, NamesModelHasNullNonKeys)
{
    std::string seen;
    script.enum_instances = [&](const Instance* model, const Script::Deliver&) {
        seen = null_bytes(model);
        return 0;
    };
    enumerate_names(a);
    EXPECT_EQ(seen, "0111111");
}

TEST_F(Instance_Operations, AFailedNameCutsTheNamesShort)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        EXPECT_FALSE(deliver(bare_element("a")));
        EXPECT_FALSE(deliver(bare_element("b")));
        return 0;
    };
    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
    const Result result = enumerate_names(class_path("Sample_Element"));
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    EXPECT_TRUE(result.paths.empty());
}

TEST_F(Instance_Operations, ANullKeyIsLeftOutOfThePath)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        Sample_Element* const element = bare_element("a");
        element->Name.null = 1;
        deliver(element);
        return 0;
    };
    const Result result = enumerate_names(class_path("Sample_Element"));
    ASSERT_EQ(result.paths.size(), 1u);
    EXPECT_TRUE(result.paths[0].keys.empty());
}

// --- getInstance

TEST_F(Instance_Operations, GetReturnsTheProvidersInstance)
{
    script.get_instance = [](const Instance*, Instance*& instance) {
        instance = bare_element("a");
        return 0;
    };
    server.core->calls.record(true);
    const Result result = get(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    ASSERT_EQ(result.instances.size(), 1u);
    // The instance is left to the server, and its path is the request's.
    EXPECT_EQ(server.calls(),
              (Texts{"CMGetClassName", "CMGetNameSpace", "CMGetKeyCount", "CMGetKeyCount", "CMGetKeyAt",
                     "CMGetKeyCount", "CMGetKeyAt", "CMGetNameSpace", "CMNewInstance", "CMNewString a",
                     "CMSetProperty Name", "CMReturnInstance", "CMReturnDone"}));
}

TEST_F(Instance_Operations, GetModelMarksWhatIsWanted)
{
    std::string seen;
    script.get_instance = [&](const Instance* model, Instance*&) {
        seen = null_bytes(model);
        EXPECT_EQ(name_of_sample(model), "a");
        return 60;
    };
    get(a);
    EXPECT_EQ(seen, "0000000") << "without a list everything";
    get(a, Property_List{"Caption"});
    EXPECT_EQ(seen, "0101111");
    get(a, Property_List{"Name"});
    EXPECT_EQ(seen, "0111111") << "a list without a non-key property";
    get(a, Property_List{"Reset", "Caption"});
    EXPECT_EQ(seen, "0111111") << "a method's name ends the list";
}

TEST_F(Instance_Operations, StatusesOfGet)
{
    const Row rows[] = {{60, 6, 0}, {62, 4, 0}, {63, 2, 0}, {64, 1, 0}, {0, 0, 1}, {65, 0, 1}, {-1, 0, 1}};
    for (const Row& row : rows) {
        script.get_instance = [&](const Instance*, Instance*& instance) {
            if (row.rc == 0)
                instance = bare_element("a");
            return row.status;
        };
        const Result result = get(a);
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
        EXPECT_EQ(result.instances.size(), row.done) << row.status;
    }
}

TEST_F(Instance_Operations, UnsupportedGetFindsByEnumeration)
{
    EXPECT_EQ(get(a).rc, CMPI_RC_ERR_NOT_FOUND);
    script.enum_instances = deliver_a_and_b;
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(bare_element("b"));
        deliver(bare_element("a"));
        return 0;
    };
    EXPECT_EQ(text_of_key(get(a).instances.at(0).path, "Name"), "a");
    EXPECT_EQ(get(path_of("Sample_Element", "c")).rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(Instance_Operations, AResultThatDoesNotConvertIsGetsCode)
{
    script.get_instance = [](const Instance*, Instance*& instance) {
        instance = bare_element("a");
        return 0;
    };
    server.core->calls.fail("CMNewInstance", 1, CMPI_RC_ERR_NOT_FOUND);
    Result result = get(a);
    EXPECT_EQ(result.rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(result.done);
    server.core->calls.fail("CMSetPropertyFilter", 1, CMPI_RC_ERR_NOT_SUPPORTED);
    result = get(a, Property_List{"Name"});
    EXPECT_EQ(result.rc, CMPI_RC_ERR_NOT_SUPPORTED) << "the filter's own code";
}

// --- createInstance

TEST_F(Instance_Operations, CreateHandsTheInstanceOverAndAnswersItsPath)
{
    script.create_instance = [](Instance* instance) {
        auto* const element = static_cast<Sample_Element*>(instance);
        EXPECT_EQ(null_bytes(element), "0011111");
        EXPECT_EQ(element->EnabledState.value, 3);
        element->Name.set("chosen by the provider");
        return 0;
    };
    const Result result = create_instance(class_path("Sample_Element"), a_off);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    ASSERT_EQ(result.paths.size(), 1u);
    EXPECT_EQ(text_of_key(result.paths[0], "Name"), "chosen by the provider");
    EXPECT_EQ(result.paths[0].name_space, NAME_SPACE);
}

TEST_F(Instance_Operations, StatusesOfCreate)
{
    const Row rows[] = {{0, 0, 1},  {80, 11, 0}, {81, 7, 0}, {82, 4, 0},
                        {83, 2, 0}, {84, 1, 0},  {85, 0, 0}, {-1, 0, 0}};
    for (const Row& row : rows) {
        script.create_instance = [&](Instance*) { return row.status; };
        const Result result = create_instance(class_path("Sample_Element"), a_off);
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
        EXPECT_EQ(result.paths.size(), row.done) << row.status;
    }
}

TEST_F(Instance_Operations, APathThatFailsIsCreatesCode)
{
    script.create_instance = [](Instance*) { return 0; };
    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_NOT_FOUND);
    const Result result = create_instance(class_path("Sample_Element"), a_off);
    EXPECT_EQ(result.rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(result.done);
}

// --- modifyInstance

TEST_F(Instance_Operations, ModifyPassesModelAndInstance)
{
    std::string model_nulls, instance_nulls;
    script.modify_instance = [&](const Instance* model, const Instance* instance) {
        model_nulls = null_bytes(model);
        instance_nulls = null_bytes(instance);
        EXPECT_EQ(static_cast<const Sample_Element*>(model)->EnabledState.value, 3);
        return 0;
    };
    server.core->calls.record(true);
    Result result = modify(a, a_off);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    EXPECT_EQ(result.paths.size(), 1u) << "the path of the request";
    EXPECT_EQ(instance_nulls, "0011111");
    EXPECT_EQ(model_nulls, "0000000") << "no list: every property counts as modified";
    EXPECT_EQ(server.core->calls.calls("CMNewObjectPath"), Texts{});

    modify(a, a_off, Property_List{"EnabledState"});
    EXPECT_EQ(model_nulls, "0011111");
    modify(a, a_off, Property_List{});
    EXPECT_EQ(model_nulls, "0111111");
}

TEST_F(Instance_Operations, StatusesOfModify)
{
    const Row rows[] = {{0, 0, 1},   {100, 6, 0}, {101, 7, 0}, {102, 4, 0},
                        {103, 2, 0}, {104, 1, 0}, {105, 0, 0}, {-1, 0, 0}};
    for (const Row& row : rows) {
        script.modify_instance = [&](const Instance*, const Instance*) { return row.status; };
        const Result result = modify(a, a_off);
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
        EXPECT_EQ(result.paths.size(), row.done) << row.status;
    }
}

// --- deleteInstance

TEST_F(Instance_Operations, StatusesOfDelete)
{
    const Row rows[] = {{0, 0, 1}, {90, 6, 0}, {91, 7, 0}, {92, 2, 0}, {93, 1, 0}, {94, 0, 1}, {-1, 0, 1}};
    for (const Row& row : rows) {
        script.delete_instance = [&](const Instance* instance) {
            EXPECT_EQ(name_of_sample(instance), "a");
            return row.status;
        };
        const Result result = remove(a);
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
    }
}

// --- execQuery, and what all have in common

TEST_F(Instance_Operations, QueriesAreNotSupported)
{
    Thread_Context* context = nullptr;
    const Result result = provider.operate(a, [&](auto ctx, auto rslt, auto cop) {
        context = Thread_Context::top();
        return mi()->ft->execQuery(mi(), ctx, rslt, cop, "SELECT * FROM Sample_Element", "WQL");
    });
    EXPECT_EQ(result.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(context, nullptr);
    EXPECT_TRUE(script.calls.empty());
}

TEST_F(Instance_Operations, AnUnknownClassFailsBeforeTheProvider)
{
    for (const char* name : {"Unknown", ""}) {
        const broker::Path_Value path = class_path(name);
        EXPECT_EQ(enumerate(path).rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(enumerate_names(path).rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(get(path).rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(create_instance(path, a_off).rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(modify(path, a_off).rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(remove(path).rc, CMPI_RC_ERR_FAILED);
    }
    EXPECT_TRUE(script.calls.empty());
}

TEST_F(Instance_Operations, AClassNameThatTheServerDoesNotGiveIsUnknown)
{
    server.core->calls.fail("CMGetClassName", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(enumerate(a).rc, CMPI_RC_ERR_FAILED);
    server.core->calls.fail("CMGetCharsPtr", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(enumerate(a).rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(script.calls.empty());
}

TEST_F(Instance_Operations, ANameSpaceThatTheServerDoesNotGiveIsEmpty)
{
    script.enum_instances = deliver_a_and_b;
    server.core->calls.fail("CMGetNameSpace", 2, CMPI_RC_ERR_FAILED);
    const Result result = enumerate_names(class_path("Sample_Element"));
    EXPECT_EQ(result.paths.at(0).name_space, "");
}
