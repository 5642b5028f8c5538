#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/dispatch/Operation.h"
#include "module/runtime/dispatch/Registration.h"
#include "tests/module/exports/Module_Fixture.h"

#include <algorithm>

namespace KPRV {
namespace {

int call(const Registration* registration, int operation, void* arg0 = nullptr, void* arg1 = nullptr,
         void* arg2 = nullptr, void* arg3 = nullptr)
{
    return registration->proc(registration, operation, arg0, arg1, arg2, arg3, nullptr, nullptr, nullptr,
                              nullptr);
}

class Registrations : public Module_Fixture
{
protected:
    void SetUp() override
    {
        Module_Fixture::SetUp();
        open("empty.json");
        for (const Registration* each = server->module().registrations(); each; each = each->next)
            all.push_back(each);
    }
    std::vector<const Registration*> all;
};

TEST_F(Registrations, RunInTheReverseOfTheClassList)
{
    ASSERT_EQ(76u, all.size());
    std::vector<std::string> names;
    for (const Registration* each : all)
        names.push_back(each->meta_class->name);
    EXPECT_EQ("KALDERA_TapeDrive", names.front());
    EXPECT_EQ("KALDERA_AdapterElementSoftwareIdentity", names.back());
    EXPECT_EQ(0, std::count(names.begin(), names.end(), "KALDERA_DiagnosticTest")) << "it is only a base";

    // The same order, seen in the repository of the classes.
    const Meta_Repository* repository = all[0]->meta_class->meta_repository;
    ASSERT_EQ(178u, repository->num_meta_classes);
    std::vector<std::string> classes;
    for (uint32 i = repository->num_meta_classes; i-- > 0;) {
        const std::string name = repository->meta_classes[i]->name;
        if (name.starts_with("KALDERA_") && name != "KALDERA_DiagnosticTest")
            classes.push_back(name);
    }
    EXPECT_EQ(classes, names);
}

TEST_F(Registrations, ShareTheNameOfTheModule)
{
    for (const Registration* each : all) {
        EXPECT_EQ(all[0]->module_name, each->module_name);
        EXPECT_EQ(std::string(each->meta_class->name) + "_Provider", each->provider_name);
    }
    EXPECT_STREQ("kldrprovider_Module", all[0]->module_name);
}

TEST_F(Registrations, ProcsServeWhatTheKindOfTheClassAsksFor)
{
    for (const Registration* each : all) {
        SCOPED_TRACE(each->provider_name);
        const bool indication = each->meta_class->flags & FLAG_INDICATION;
        const bool association = each->meta_class->flags & FLAG_ASSOCIATION;

        const Meta_Class* meta_class = nullptr;
        EXPECT_EQ(0, call(each, OP_GET_META_CLASS, &meta_class));
        EXPECT_EQ(each->meta_class, meta_class);
        const Meta_Repository* repository = nullptr;
        EXPECT_EQ(0, call(each, OP_GET_REPOSITORY, &repository));
        EXPECT_EQ(each->meta_class->meta_repository, repository);

        void* provider = nullptr;
        EXPECT_EQ(0, call(each, OP_CREATE_PROVIDER, &provider));
        ASSERT_TRUE(provider);
        EXPECT_EQ(0, call(each, OP_LOAD, provider));
        Instance* found = nullptr;
        EXPECT_EQ(indication ? -1 : 61, call(each, OP_GET_INSTANCE, provider, nullptr, &found));
        EXPECT_EQ(indication ? -1 : 81, call(each, OP_CREATE_INSTANCE, provider));
        EXPECT_EQ(indication ? -1 : 91, call(each, OP_DELETE_INSTANCE, provider));
        EXPECT_EQ(indication ? -1 : 101, call(each, OP_MODIFY_INSTANCE, provider));
        EXPECT_EQ(-1, call(each, 17, provider));
        EXPECT_EQ(-1, call(each, -1, provider));
        if (!association) {
            EXPECT_EQ(-1, call(each, OP_ENUM_ASSOCIATOR_NAMES, provider));
            EXPECT_EQ(-1, call(each, OP_ENUM_REFERENCES, provider));
            EXPECT_EQ(-1, call(each, OP_ENUM_ASSOCIATORS, provider));
        }
        if (!indication) {
            EXPECT_EQ(-1, call(each, OP_ENABLE_INDICATIONS, provider));
            EXPECT_EQ(-1, call(each, OP_DISABLE_INDICATIONS, provider));
        }
        EXPECT_EQ(0, call(each, OP_UNLOAD, provider));
        EXPECT_EQ(0, call(each, OP_DESTROY_PROVIDER, provider));
        EXPECT_EQ(0, call(each, OP_DESTROY_PROVIDER, nullptr));
    }
}

TEST_F(Registrations, AssociationsLeaveTraversalToTheAdapterAndSendNoEndMark)
{
    static int marks;
    marks = 0;
    const auto proc = [](Instance*, int, void*) -> bool {
        marks++;
        return true;
    };
    const Instance_Handler_Proc handler = proc;
    void* const arg = reinterpret_cast<void*>(handler);
    String none;
    for (const Registration* each : all) {
        if (!(each->meta_class->flags & FLAG_ASSOCIATION))
            continue;
        SCOPED_TRACE(each->provider_name);
        void* provider = nullptr;
        call(each, OP_CREATE_PROVIDER, &provider);
        EXPECT_EQ(111, each->proc(each, OP_ENUM_ASSOCIATOR_NAMES, provider, nullptr, &none, &none, &none, arg,
                                  nullptr, nullptr));
        EXPECT_EQ(121, each->proc(each, OP_ENUM_REFERENCES, provider, nullptr, nullptr, &none, arg, nullptr,
                                  nullptr, nullptr));
        EXPECT_EQ(171, each->proc(each, OP_ENUM_ASSOCIATORS, provider, nullptr, &none, &none, &none, arg,
                                  nullptr, nullptr));
        call(each, OP_DESTROY_PROVIDER, provider);
    }
    EXPECT_EQ(0, marks);
}

TEST_F(Registrations, LongAndShortFactoryNamesLeadToOneProvider)
{
    using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto factory = [&](const char* name) {
        return reinterpret_cast<Factory>(server->module().symbol(name));
    };
    const Factory by_provider = factory("KALDERA_Product_Provider_Create_InstanceMI");
    const Factory by_class = factory("KALDERA_Product_Create_InstanceMI");
    ASSERT_TRUE(by_provider && by_class);

    const CMPIBroker* broker = server->broker().cmpi();
    // The status is never written: servers preset it, and some hand in none.
    CMPIStatus status = {static_cast<CMPIrc>(77), nullptr};
    CMPIInstanceMI* mi = by_provider(broker, nullptr, &status);
    ASSERT_TRUE(mi);
    EXPECT_EQ(77, status.rc);
    EXPECT_EQ(mi, by_class(broker, nullptr, nullptr));
    EXPECT_EQ(100, mi->ft->ftVersion);
    EXPECT_EQ(100, mi->ft->miVersion);
    // The four names are written into one slot; the last one stays.
    EXPECT_STREQ("associationKALDERA_Product_Provider", mi->ft->miName);

    mi->ft->cleanup(mi, nullptr, 0);
    mi->ft->cleanup(mi, nullptr, 0);
}

} // namespace
} // namespace KPRV
