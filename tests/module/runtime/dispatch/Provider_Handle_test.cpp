#include "module/runtime/dispatch/Provider_Handle.h"
#include "module/runtime/objects/Ref.h"
#include "tests/module/runtime/dispatch/Scripted_Provider.h"

#include <gtest/gtest.h>

using namespace KPRV;

using Calls = std::vector<std::string>;

namespace {

/// Takes over what a handle streams: a name for each instance, and each end mark with its status.
struct Received
{
    std::vector<std::string> list;

    static bool proc(Instance* instance, int status, void* client_data)
    {
        auto* const self = static_cast<Received*>(client_data);
        const Ref<Instance> owner(instance);
        self->list.push_back(instance ? name_of_sample(instance) : "end " + std::to_string(status));
        return instance != nullptr;
    }
    /// For association instances, by the names of their ends.
    static bool link_proc(Instance* instance, int status, void* client_data)
    {
        if (!instance)
            return proc(nullptr, status, client_data);
        const Ref<Instance> owner(instance);
        auto* const link = static_cast<Sample_Link*>(instance);
        static_cast<Received*>(client_data)
            ->list.push_back(name_of_sample(link->Antecedent) + "-" + name_of_sample(link->Dependent));
        return true;
    }
};

class Provider_Handle_Test : public testing::Test
{
protected:
    Provider_Handle_Test() { script = Script(); }
    ~Provider_Handle_Test() override { script = Script(); }

    const Ref<Instance> model{make_named("a")};
    const Ref<Instance> port{make_port("b")};
    Received received;
};

/// Two links of a, and one of others.
int three_links(const Instance*, const Script::Deliver& deliver)
{
    deliver(make_link(make_named("a"), make_port("b")));
    deliver(make_link(make_named("a"), make_port("c")));
    deliver(make_link(make_named("x"), make_port("y")));
    return ENUM_INSTANCES_OK;
}

std::function<int(const Instance*, const Script::Deliver&)> enumeration_status(int status)
{
    return [status](const Instance*, const Script::Deliver&) { return status; };
}

} // namespace

TEST_F(Provider_Handle_Test, OwnsTheProviderObject)
{
    {
        Provider_Handle handle(element_registration);
        EXPECT_EQ(handle.load(), 0);
        EXPECT_EQ(handle.unload(), 0);
    }
    EXPECT_EQ(script.calls, (Calls{"construct", "load", "unload", "destroy"}));
}

TEST_F(Provider_Handle_Test, PassesStatusesOfLifeCycleThrough)
{
    script.load = [] { return 5; };
    script.unload = [] { return 6; };
    Provider_Handle handle(element_registration);
    EXPECT_EQ(handle.load(), 5);
    EXPECT_EQ(handle.unload(), 6);
}

TEST_F(Provider_Handle_Test, TellsClassAndRepository)
{
    const Provider_Handle handle(element_registration);
    const Meta_Class* meta_class = nullptr;
    const Meta_Repository* repository = nullptr;
    EXPECT_EQ(handle.get_meta_class(meta_class), 0);
    EXPECT_EQ(handle.get_repository(repository), 0);
    EXPECT_EQ(meta_class, &Sample_Element::static_meta_class);
    EXPECT_EQ(repository, &sample_repository);
}

TEST_F(Provider_Handle_Test, GetInstancePassesTheProvidersOwnAnswersThrough)
{
    Provider_Handle handle(element_registration);
    for (const int status : {0, 60, 62, 63, 64, 99}) {
        script.get_instance = [&](const Instance* x, Instance*& instance) {
            EXPECT_EQ(x, model.ptr());
            instance = status == 0 ? make_named("found") : nullptr;
            return status;
        };
        Instance* instance = model.ptr();
        EXPECT_EQ(handle.get_instance(model.ptr(), instance), status);
        EXPECT_EQ(instance != nullptr, status == 0);
        unref(instance);
    }
    EXPECT_EQ(std::count(script.calls.begin(), script.calls.end(), "enum_instances"), 0);
}

TEST_F(Provider_Handle_Test, UnsupportedGetInstanceEnumerates)
{
    script.enum_instances = [&](const Instance* x, const Script::Deliver& deliver) {
        EXPECT_EQ(x, model.ptr());
        EXPECT_TRUE(deliver(make_named("z")));
        EXPECT_FALSE(deliver(make_named("a"))) << "found";
        EXPECT_TRUE(deliver(make_named("b"))) << "providers run to their end";
        return 0;
    };
    Provider_Handle handle(element_registration);
    Instance* instance = nullptr;
    ASSERT_EQ(handle.get_instance(model.ptr(), instance), 0);
    EXPECT_EQ(name_of_sample(instance), "a");
    unref(instance);
    EXPECT_EQ(script.calls, (Calls{"construct", "get_instance", "enum_instances"}));
}

TEST_F(Provider_Handle_Test, TheLastOfSeveralMatchesIsKept)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        for (const uint16 state : {1, 2}) {
            Sample_Element* const element = make_named("a");
            element->EnabledState.set(state);
            deliver(element);
        }
        return 0;
    };
    Provider_Handle handle(element_registration);
    Instance* instance = nullptr;
    ASSERT_EQ(handle.get_instance(model.ptr(), instance), 0);
    EXPECT_EQ(static_cast<Sample_Element*>(instance)->EnabledState.value, 2);
    unref(instance);
}

TEST_F(Provider_Handle_Test, EnumerationWithoutTheInstanceIsNotFound)
{
    Provider_Handle handle(element_registration);
    Instance* instance = nullptr;
    EXPECT_EQ(handle.get_instance(model.ptr(), instance), 60) << "nothing enumerated";

    for (const int status : {70, 71, -1}) {
        script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) {
            deliver(make_named("a"));
            return status;
        };
        EXPECT_EQ(handle.get_instance(model.ptr(), instance), 60) << "found, but the enumeration failed";
        EXPECT_EQ(instance, nullptr);
    }
}

TEST_F(Provider_Handle_Test, EnumInstancesEndsWithTheStatus)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(make_named("a"));
        return 70;
    };
    Provider_Handle handle(element_registration);
    EXPECT_EQ(handle.enum_instances(model.ptr(), Received::proc, &received), 70);
    EXPECT_EQ(received.list, (Calls{"a", "end 70"}));
}

TEST_F(Provider_Handle_Test, ChangesPassTheirArgumentsAndStatuses)
{
    Provider_Handle handle(element_registration);
    EXPECT_EQ(handle.create_instance(model.ptr()), 81);
    EXPECT_EQ(handle.delete_instance(model.ptr()), 91);
    EXPECT_EQ(handle.modify_instance(model.ptr(), port.ptr()), 101);

    script.create_instance = [&](Instance* x) { return x == model.ptr() ? 80 : -2; };
    script.delete_instance = [&](const Instance* x) { return x == model.ptr() ? 90 : -2; };
    script.modify_instance = [&](const Instance* a, const Instance* b) {
        return a == model.ptr() && b == port.ptr() ? 100 : -2;
    };
    script.invoke = [&](const Instance* self, Instance* method) {
        return self == model.ptr() && method == port.ptr() ? 130 : -2;
    };
    EXPECT_EQ(handle.create_instance(model.ptr()), 80);
    EXPECT_EQ(handle.delete_instance(model.ptr()), 90);
    EXPECT_EQ(handle.modify_instance(model.ptr(), port.ptr()), 100);
    EXPECT_EQ(handle.invoke_method(model.ptr(), port.ptr()), 130);
}

TEST_F(Provider_Handle_Test, IndicationsGoThroughTheHandler)
{
    std::vector<std::string> heard;
    Script::Deliver deliver;
    script.enable_indications = [&](const Script::Deliver& x) {
        deliver = x;
        return 0;
    };
    script.disable_indications = [] { return 150; };
    Provider_Handle handle(alert_registration);
    const auto proc = [](Instance* instance, void* client_data) {
        const Ref<Instance> owner(instance);
        static_cast<std::vector<std::string>*>(client_data)
            ->push_back(instance ? name_of_sample(instance) : "end");
        return true;
    };
    EXPECT_EQ(handle.enable_indications(proc, &heard), 0);
    deliver(make_named("alert"));
    deliver(nullptr);
    EXPECT_EQ(handle.disable_indications(), 150);
    EXPECT_EQ(heard, (Calls{"alert", "end"}));
}

TEST_F(Provider_Handle_Test, OperationsOfOtherKindsAreMinusOne)
{
    Provider_Handle instances(element_registration);
    EXPECT_EQ(instances.enable_indications(nullptr, nullptr), -1);
    EXPECT_EQ(instances.disable_indications(), -1);
    EXPECT_EQ(instances.enum_associators(model.ptr(), "", "", "", Received::proc, &received), -1);

    Provider_Handle alerts(alert_registration);
    Instance* instance = nullptr;
    EXPECT_EQ(alerts.get_instance(model.ptr(), instance), -1);
    EXPECT_EQ(alerts.enum_instances(model.ptr(), Received::proc, &received), -1);
    EXPECT_EQ(alerts.create_instance(model.ptr()), -1);
    EXPECT_EQ(alerts.delete_instance(model.ptr()), -1);
    EXPECT_EQ(alerts.modify_instance(model.ptr(), model.ptr()), -1);
    EXPECT_EQ(alerts.invoke_method(model.ptr(), model.ptr()), -1);
    EXPECT_TRUE(received.list.empty());
}

TEST_F(Provider_Handle_Test, AssociationsAreRefusedForOtherClasses)
{
    Provider_Handle handle(element_registration);
    EXPECT_EQ(handle.enum_associator_names(model.ptr(), "", "", "", Received::proc, &received), 110);
    EXPECT_EQ(handle.enum_references(model.ptr(), model.ptr(), "", Received::proc, &received), 120);
    EXPECT_EQ(script.calls, Calls{"construct"});
    EXPECT_TRUE(received.list.empty());
}

TEST_F(Provider_Handle_Test, OwnAssociatorNamesEndTheCall)
{
    const struct
    {
        int own;
        int result;
    } rows[] = {{0, 0}, {110, 110}, {112, 110}};
    Provider_Handle handle(link_registration);
    for (const auto& row : rows) {
        script.calls.clear();
        received.list.clear();
        script.enum_associator_names = [&](const Instance* x, const std::string& filters,
                                           const Script::Deliver& deliver) {
            EXPECT_EQ(x, model.ptr());
            EXPECT_EQ(filters, "C|r|R");
            deliver(make_port("far"));
            return row.own;
        };
        EXPECT_EQ(handle.enum_associator_names(model.ptr(), "C", "r", "R", Received::proc, &received),
                  row.result);
        EXPECT_EQ(script.calls, Calls{"enum_associator_names"});
        EXPECT_EQ(received.list, (Calls{"far", "end " + std::to_string(row.own)}));
    }
}

TEST_F(Provider_Handle_Test, AssociatorNamesFallBackOnEnumeration)
{
    script.enum_instances = [](const Instance* link_model, const Script::Deliver& deliver) {
        EXPECT_EQ(link_model->__meta_class, &Sample_Link::static_meta_class);
        return three_links(link_model, deliver);
    };
    Provider_Handle handle(link_registration);
    EXPECT_EQ(handle.enum_associator_names(model.ptr(), "", "", "", Received::proc, &received), 0);
    EXPECT_EQ(received.list, (Calls{"b", "c", "end 0"}));
    EXPECT_EQ(script.calls, (Calls{"construct", "enum_associator_names", "enum_instances"}));

    received.list.clear();
    EXPECT_EQ(handle.enum_associator_names(model.ptr(), "", "Dependent", "", Received::proc, &received), 0);
    EXPECT_EQ(received.list, Calls{"end 0"});
}

TEST_F(Provider_Handle_Test, AnyOtherOwnStatusFallsBackToo)
{
    script.enum_associator_names = [](const Instance*, const std::string&, const Script::Deliver&) {
        return 99;
    };
    script.enum_instances = three_links;
    Provider_Handle handle(link_registration);
    EXPECT_EQ(handle.enum_associator_names(model.ptr(), "", "", "", Received::proc, &received), 0);
    EXPECT_EQ(received.list, (Calls{"end 99", "b", "c", "end 0"})) << "only 111 suppresses the own end mark";
}

TEST_F(Provider_Handle_Test, StatusesOfTheAssociatorNamesFallback)
{
    const struct
    {
        int enumeration;
        int result;
    } rows[] = {{0, 0}, {70, 110}, {71, 112}, {-1, 0}};
    Provider_Handle handle(link_registration);
    for (const auto& row : rows) {
        received.list.clear();
        script.enum_instances = enumeration_status(row.enumeration);
        EXPECT_EQ(handle.enum_associator_names(model.ptr(), "", "", "", Received::proc, &received),
                  row.result);
        EXPECT_EQ(received.list, Calls{"end 0"});
    }
}

TEST_F(Provider_Handle_Test, OwnReferencesEndTheCall)
{
    const Ref<Instance> link_model(create<Sample_Link>(false));
    Provider_Handle handle(link_registration);
    for (const int status : {0, 120, 122}) {
        script.calls.clear();
        received.list.clear();
        script.enum_references = [&](const Instance* x, const Instance* y, const std::string& role,
                                     const Script::Deliver& deliver) {
            EXPECT_EQ(x, model.ptr());
            EXPECT_EQ(y, link_model.ptr());
            EXPECT_EQ(role, "r");
            deliver(make_link(make_named("a"), make_port("b")));
            return status;
        };
        EXPECT_EQ(handle.enum_references(model.ptr(), link_model.ptr(), "r", Received::link_proc, &received),
                  status);
        EXPECT_EQ(script.calls, Calls{"enum_references"});
        EXPECT_EQ(received.list, (Calls{"a-b", "end " + std::to_string(status)}));
    }
}

TEST_F(Provider_Handle_Test, ReferencesFallBackOnEnumeration)
{
    const Ref<Instance> link_model(create<Sample_Link>(false));
    script.enum_instances = [&](const Instance* x, const Script::Deliver& deliver) {
        EXPECT_EQ(x, link_model.ptr());
        return three_links(x, deliver);
    };
    Provider_Handle handle(link_registration);
    EXPECT_EQ(handle.enum_references(model.ptr(), link_model.ptr(), "", Received::link_proc, &received), 0);
    EXPECT_EQ(received.list, (Calls{"a-b", "a-c", "end 0"}));

    received.list.clear();
    EXPECT_EQ(
        handle.enum_references(model.ptr(), link_model.ptr(), "Dependent", Received::link_proc, &received),
        0);
    EXPECT_EQ(received.list, Calls{"end 0"});

    received.list.clear();
    EXPECT_EQ(handle.enum_references(port.ptr(), link_model.ptr(), "", Received::link_proc, &received), 0);
    EXPECT_EQ(received.list, (Calls{"a-b", "end 0"}));
}

TEST_F(Provider_Handle_Test, StatusesOfTheReferencesFallback)
{
    const struct
    {
        int enumeration;
        int result;
    } rows[] = {{0, 0}, {70, 120}, {71, 122}, {-1, 0}};
    Provider_Handle handle(link_registration);
    for (const auto& row : rows) {
        received.list.clear();
        script.enum_instances = enumeration_status(row.enumeration);
        EXPECT_EQ(handle.enum_references(model.ptr(), model.ptr(), "", Received::proc, &received),
                  row.result);
        EXPECT_EQ(received.list, Calls{"end 0"});
    }
}
