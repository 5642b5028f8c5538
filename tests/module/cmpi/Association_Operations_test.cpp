#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;
using broker::Result;

namespace {

/// The filters of a call, null where not given.
struct Filters
{
    const char* result_class = nullptr;
    const char* role = nullptr;
    const char* result_role = nullptr;
};

class Association_Operations : public testing::Test
{
protected:
    explicit Association_Operations(const Registration* registration = link_registration)
        : provider(server, registration)
    {
        provider.factory('A');
        script.calls.clear();
    }
    ~Association_Operations() override { provider.cleanup('A'); }

    CMPIAssociationMI* mi() { return &provider.data().association_mi; }

    Result associators(const broker::Path_Value& path, Filters filters = {},
                       const char** properties = nullptr)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->associators(mi(), context, result, cop, "Ignored", filters.result_class,
                                         filters.role, filters.result_role, properties);
        });
    }
    Result associator_names(const broker::Path_Value& path, Filters filters = {})
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->associatorNames(mi(), context, result, cop, "Ignored", filters.result_class,
                                             filters.role, filters.result_role);
        });
    }
    Result references(const broker::Path_Value& path, const char* role = nullptr,
                      const char** properties = nullptr)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->references(mi(), context, result, cop, "Ignored", role, properties);
        });
    }
    Result reference_names(const broker::Path_Value& path, const char* role = nullptr)
    {
        return provider.operate(path, [&](auto context, auto result, auto cop) {
            return mi()->ft->referenceNames(mi(), context, result, cop, "Ignored", role);
        });
    }

    Test_Server server;
    Served_Provider provider;
    const broker::Path_Value a = path_of("Sample_Element", "a");
};

class No_Association : public Association_Operations
{
protected:
    No_Association() : Association_Operations(element_registration) {}
};

/// Two links of a, and one of others.
int three_links(const Instance*, const Script::Deliver& deliver)
{
    deliver(make_link(make_named("a"), make_port("b")));
    deliver(make_link(make_named("a"), make_port("c")));
    deliver(make_link(make_named("x"), make_port("y")));
    return 0;
}

Texts names_of(const std::vector<broker::Path_Value>& paths)
{
    Texts names;
    for (const broker::Path_Value& path : paths)
        names.push_back(text_of_key(path, "Name"));
    return names;
}

/// "antecedent-dependent" of each link.
Texts links_of(const std::vector<broker::Path_Value>& paths)
{
    Texts names;
    for (const broker::Path_Value& path : paths) {
        names.push_back(text_of_key(*path.key("Antecedent")->as_path(), "Name") + "-" +
                        text_of_key(*path.key("Dependent")->as_path(), "Name"));
    }
    return names;
}

/// Answers an up-call with the object of its path.
Result answer_get(const broker::Request& request)
{
    Result result;
    EXPECT_EQ(request.operation, broker::Operation::GET_INSTANCE);
    result.instances.push_back({request.path, {{"Name", *request.path.key("Name")}}});
    return result;
}

} // namespace

// --- associatorNames

TEST_F(Association_Operations, NamesOfFarEndsComeFromTheEnumeration)
{
    script.enum_instances = three_links;
    const Result result = associator_names(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(names_of(result.paths), (Texts{"b", "c"}));
    EXPECT_EQ(result.paths[0].class_name, "Sample_Port");
    EXPECT_EQ(result.paths[0].name_space, NAME_SPACE);
    EXPECT_EQ(result.done_count, 0u) << "the return of the entry is the end";
}

TEST_F(Association_Operations, NamesMakeTheirCallsInOrder)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(make_link(make_named("a"), make_port("b")));
        return 0;
    };
    server.core->calls.record(true);
    associator_names(a);
    EXPECT_EQ(server.calls(), (Texts{"CMGetClassName", "CMGetNameSpace", "CMGetKeyCount", "CMGetKeyCount",
                                     "CMGetKeyAt", "CMGetKeyCount", "CMGetKeyAt", "CMGetNameSpace",
                                     "CMNewObjectPath Sample_Port", "CMNewString b", "CMAddKey Name",
                                     "CMAddKey Number", "CMReturnObjectPath", "CMRelease object path"}));
}

TEST_F(Association_Operations, FiltersReachTheProviderAndNullOnesAreEmpty)
{
    Texts seen;
    script.enum_associator_names = [&](const Instance*, const std::string& filters, const Script::Deliver&) {
        seen.push_back(filters);
        return 0;
    };
    associator_names(a);
    associator_names(a, {"Sample_Port", "Antecedent", "Dependent"});
    EXPECT_EQ(seen, (Texts{"||", "Sample_Port|Antecedent|Dependent"}));
}

TEST_F(Association_Operations, FiltersWorkInTheFallback)
{
    script.enum_instances = three_links;
    EXPECT_EQ(associator_names(a, {.result_class = "Sample_Element"}).paths.size(), 2u);
    EXPECT_EQ(associator_names(a, {.result_class = "Sample_Other"}).paths.size(), 0u);
    EXPECT_EQ(associator_names(a, {.role = "Antecedent"}).paths.size(), 2u);
    EXPECT_EQ(associator_names(a, {.role = "Dependent"}).paths.size(), 0u);
    EXPECT_EQ(associator_names(a, {.result_role = "Dependent"}).paths.size(), 2u);
    EXPECT_EQ(associator_names(a, {.result_role = "Antecedent"}).paths.size(), 0u);
}

TEST_F(Association_Operations, StatusesOfNames)
{
    const struct
    {
        int own;
        int enumeration;
        int rc;
    } rows[] = {{0, 0, 0}, {110, 0, 1}, {112, 0, 1}, {111, 0, 0}, {111, 70, 1}, {111, 71, 2}, {111, 99, 0}};
    for (const auto& row : rows) {
        script.enum_associator_names = [&](const Instance*, const std::string&, const Script::Deliver&) {
            return row.own;
        };
        script.enum_instances = [&](const Instance*, const Script::Deliver&) { return row.enumeration; };
        EXPECT_EQ(associator_names(a).rc, row.rc) << row.own << " " << row.enumeration;
    }
}

TEST_F(Association_Operations, AFarEndKeepsItsOwnNameSpace)
{
    script.enum_associator_names = [](const Instance*, const std::string&, const Script::Deliver& deliver) {
        Sample_Port* const port = make_port("b");
        port->__name_space = "root/elsewhere";
        deliver(port);
        return 0;
    };
    EXPECT_EQ(associator_names(a).paths.at(0).name_space, "root/elsewhere");
}

TEST_F(Association_Operations, AFailedNameDropsTheRestAndKeepsTheStatus)
{
    script.enum_instances = three_links;
    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
    const Result result = associator_names(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_TRUE(result.paths.empty());
}

// --- associators

TEST_F(Association_Operations, OwnAssociatorsAreReturnedWithPathsBuiltOnTheWay)
{
    Log_Capture capture;
    script.enum_associators = [](const Instance* instance, const std::string& filters,
                                 const Script::Deliver& deliver) {
        EXPECT_EQ(name_of_sample(instance), "a");
        EXPECT_EQ(filters, "|r|");
        deliver(make_port("b", 7));
        return 0;
    };
    const Result result = associators(a, {.role = "r"}, Property_List{"Name"});
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    ASSERT_EQ(result.instances.size(), 1u);
    EXPECT_EQ(result.instances[0].path.class_name, "Sample_Port");
    EXPECT_EQ(result.instances[0].properties.size(), 1u);
    EXPECT_EQ(result.done_count, 0u);
    EXPECT_EQ(script.calls, Texts{"enum_associators"});
    EXPECT_EQ(capture.said("WARN"), Texts{"WARN No ObjectPath built before call to make_CMPI_instance"});
}

TEST_F(Association_Operations, AssociatorsByNameAreAskedOfTheServer)
{
    script.enum_instances = three_links;
    server.on_up_call = answer_get;
    server.core->calls.record(true);
    const Result result = associators(a, {}, Property_List{"Name"});
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    ASSERT_EQ(result.instances.size(), 2u);
    EXPECT_EQ(text_of_key(result.instances[1].path, "Name"), "c");
    EXPECT_EQ(script.calls, (Texts{"enum_associators", "enum_associator_names", "enum_instances"}));
    const Texts calls = server.calls();
    const auto first = std::find(calls.begin(), calls.end(), "CMNewObjectPath Sample_Port");
    ASSERT_NE(first, calls.end());
    EXPECT_EQ(Texts(first, first + 7),
              (Texts{"CMNewObjectPath Sample_Port", "CMNewString b", "CMAddKey Name", "CMAddKey Number",
                     "CBGetInstance Sample_Port", "CMReturnInstance", "CMRelease instance"}));
}

TEST_F(Association_Operations, AFarEndThatTheServerLacksEndsTheStream)
{
    script.enum_instances = three_links;
    server.on_up_call = [](const broker::Request& request) {
        if (text_of_key(request.path, "Name") == "b")
            return Result{.rc = CMPI_RC_ERR_NOT_FOUND};
        return answer_get(request);
    };
    const Result result = associators(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK) << "the provider's status";
    EXPECT_TRUE(result.instances.empty());
}

TEST_F(Association_Operations, AnAssociatorThatDoesNotConvertEndsTheStream)
{
    script.enum_associators = [](const Instance*, const std::string&, const Script::Deliver& deliver) {
        EXPECT_FALSE(deliver(make_port("b")));
        EXPECT_FALSE(deliver(make_port("c")));
        return 0;
    };
    server.core->calls.fail("CMNewInstance", 1, CMPI_RC_ERR_FAILED);
    const Result result = associators(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_TRUE(result.instances.empty());
}

TEST_F(Association_Operations, StatusesOfAssociators)
{
    const struct
    {
        int own;
        int names;
        int rc;
        bool asks_names;
    } rows[] = {{0, 0, 0, false},    {170, 0, 1, false},  {172, 0, 2, false}, {171, 0, 0, true},
                {171, 110, 1, true}, {171, 112, 1, true}, {99, 0, 0, true}};
    for (const auto& row : rows) {
        script.calls.clear();
        script.enum_associators = [&](const Instance*, const std::string&, const Script::Deliver&) {
            return row.own;
        };
        script.enum_associator_names = [&](const Instance*, const std::string&, const Script::Deliver&) {
            return row.names;
        };
        EXPECT_EQ(associators(a).rc, row.rc) << row.own << " " << row.names;
        EXPECT_EQ(script.calls.size(), row.asks_names ? 2u : 1u) << row.own;
    }
    script.enum_associators = nullptr;
    script.enum_associator_names = nullptr;
    script.enum_instances = [](const Instance*, const Script::Deliver&) { return 71; };
    EXPECT_EQ(associators(a).rc, CMPI_RC_ERR_ACCESS_DENIED);
}

TEST_F(Association_Operations, EndsOfOneClassWithOtherKeysGiveTheOtherEnd)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(make_link(make_port("p", 1), make_port("q", 2)));
        return 0;
    };
    broker::Path_Value p = path_of("Sample_Port", "p");
    p.keys.push_back({"Number", broker::Plain_Value::unsigned_number(CMPI_uint64, 1)});
    EXPECT_EQ(names_of(associator_names(p).paths), Texts{"q"});
}

// --- references

TEST_F(Association_Operations, ReferencesComeFromTheEnumeration)
{
    const Instance* seen = nullptr;
    script.enum_instances = [&](const Instance* model, const Script::Deliver& deliver) {
        EXPECT_EQ(model->__meta_class, &Sample_Link::static_meta_class);
        seen = model;
        return three_links(model, deliver);
    };
    const Result result = references(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    ASSERT_EQ(result.instances.size(), 2u);
    EXPECT_EQ(result.instances[0].path.class_name, "Sample_Link");
    EXPECT_EQ(text_of_key(*result.instances[0].property("Dependent")->as_path(), "Name"), "b");
    EXPECT_EQ(result.done_count, 0u);
    EXPECT_NE(seen, nullptr);

    EXPECT_EQ(references(a, "Antecedent").instances.size(), 2u);
    EXPECT_EQ(references(a, "Dependent").instances.size(), 0u);
}

TEST_F(Association_Operations, ReferencesAreAnsweredInTheNameSpaceOfTheRequest)
{
    script.enum_references = [](const Instance*, const Instance*, const std::string&,
                                const Script::Deliver& deliver) {
        Sample_Link* const link = make_link(make_named("a"), make_port("b"));
        link->__name_space = "root/elsewhere";
        deliver(link);
        return 0;
    };
    EXPECT_EQ(references(a).instances.at(0).path.name_space, NAME_SPACE);
    EXPECT_EQ(reference_names(a).paths.at(0).name_space, NAME_SPACE);
}

TEST_F(Association_Operations, ReferencesMakeTheirCallsInOrder)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(make_link(make_named("a"), make_port("b")));
        return 0;
    };
    server.core->calls.record(true);
    references(a, nullptr, Property_List{"Dependent"});
    const Texts calls = server.calls();
    // Two keys, each a path of its own, then the same two as properties.
    const Texts ends = {"CMNewObjectPath Sample_Element",
                        "CMNewString a",
                        "CMAddKey Name",
                        "CMAddKey Antecedent",
                        "CMNewObjectPath Sample_Port",
                        "CMNewString b",
                        "CMAddKey Name",
                        "CMAddKey Number",
                        "CMAddKey Dependent"};
    const auto link = std::find(calls.begin(), calls.end(), "CMNewObjectPath Sample_Link");
    ASSERT_NE(link, calls.end());
    EXPECT_EQ(Texts(link + 1, link + 10), ends);
    EXPECT_EQ(*(link + 10), "CMNewInstance");
    EXPECT_EQ(*(link + 11), "CMSetPropertyFilter");
    EXPECT_EQ(Texts(calls.end() - 2, calls.end()), (Texts{"CMReturnInstance", "CMRelease instance"}));
}

TEST_F(Association_Operations, StatusesOfReferences)
{
    const struct
    {
        int own;
        int enumeration;
        int rc;
    } rows[] = {{0, 0, 0}, {120, 0, 1}, {122, 0, 2}, {121, 0, 0}, {121, 70, 1}, {121, 71, 2}, {121, 99, 0}};
    for (const auto& row : rows) {
        script.enum_references = [&](const Instance*, const Instance*, const std::string&,
                                     const Script::Deliver&) { return row.own; };
        script.enum_instances = [&](const Instance*, const Script::Deliver&) { return row.enumeration; };
        EXPECT_EQ(references(a).rc, row.rc) << row.own << " " << row.enumeration;
        EXPECT_EQ(reference_names(a).rc, row.rc) << row.own << " " << row.enumeration;
    }
}

TEST_F(Association_Operations, AReferenceThatDoesNotConvertEndsTheStream)
{
    script.enum_instances = three_links;
    for (const char* call : {"CMNewObjectPath", "CMNewInstance"}) {
        server.core->calls.fail(call, 1, CMPI_RC_ERR_FAILED);
        const Result result = references(a);
        EXPECT_EQ(result.rc, CMPI_RC_OK);
        EXPECT_TRUE(result.instances.empty());
    }
    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(reference_names(a).paths.empty());
}

TEST_F(Association_Operations, ReferenceNamesArePathsOfBothEnds)
{
    script.enum_instances = three_links;
    const Result result = reference_names(a);
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(links_of(result.paths), (Texts{"a-b", "a-c"}));
    EXPECT_EQ(result.done_count, 0u);
}

// --- what all have in common

TEST_F(Association_Operations, AnObjectOfAForeignClassHasNoAssociations)
{
    Log_Capture capture;
    const broker::Path_Value foreign = class_path("Foreign");
    EXPECT_EQ(associators(foreign).rc, CMPI_RC_OK);
    EXPECT_EQ(associator_names(foreign).rc, CMPI_RC_OK);
    EXPECT_EQ(references(foreign).rc, CMPI_RC_OK);
    EXPECT_EQ(reference_names(foreign).rc, CMPI_RC_OK);
    EXPECT_TRUE(script.calls.empty());
    EXPECT_EQ(
        capture.said("DBG"),
        (Texts{"DBG enter: associators()", "DBG return: associators(): CMPI_RC_OK",
               "DBG enter: associatorNames()", "DBG return: associatorNames(): CMPI_RC_ERR_INVALID_CLASS",
               "DBG enter: references()", "DBG return: references(): CMPI_RC_ERR_INVALID_CLASS",
               "DBG enter: referenceNames()", "DBG return: referenceNames(): CMPI_RC_ERR_INVALID_CLASS"}));
}

TEST_F(Association_Operations, AnExceptionLeavesNoContextAndNoLock)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) -> int {
        deliver(make_link(make_named("a"), make_port("b")));
        throw std::runtime_error("links");
    };
    EXPECT_TRUE(associators(a).exception);
    EXPECT_TRUE(associator_names(a).exception);
    EXPECT_TRUE(references(a).exception);
    EXPECT_TRUE(reference_names(a).exception);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    EXPECT_EQ(provider.adapter()->adapter_mutex.try_lock(), 0);
    provider.adapter()->adapter_mutex.unlock();
    server.core->violations.clear();
    script.enum_instances = three_links;
    EXPECT_EQ(associator_names(a).paths.size(), 2u);
}

TEST_F(Association_Operations, AThrowingServerLeavesNoInstanceBehind)
{
    script.enum_instances = three_links;
    for (const char* call : {"CMNewObjectPath", "CMReturnObjectPath"}) {
        server.core->calls.throw_at(call, 1);
        EXPECT_TRUE(associator_names(a).exception);
        server.core->calls.throw_at(call, 1);
        EXPECT_TRUE(reference_names(a).exception);
    }
    server.core->violations.clear();
}

TEST_F(No_Association, AllFourEntriesFail)
{
    EXPECT_EQ(associators(a).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(associator_names(a).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(references(a).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(reference_names(a).rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(script.calls.empty());
}
