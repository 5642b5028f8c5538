#include "tests/module/schema/Catalogue_View.h"

#include "module/runtime/dispatch/Provider_Dispatch.h"
#include "module/schema/KALDERA_AgentService_Skeleton.h"
#include "module/schema/KALDERA_AlertIndication_Skeleton.h"
#include "module/schema/KALDERA_ConcreteJob_Skeleton.h"
#include "module/schema/KALDERA_FCPort_Skeleton.h"
#include "module/schema/KALDERA_HostedCollection_Skeleton.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

/// Providers that implement nothing, and one that implements a method.
class Port_Provider : public KALDERA_FCPort_Skeleton
{
};
class Collection_Provider : public KALDERA_HostedCollection_Skeleton
{
};
class Alert_Provider : public KALDERA_AlertIndication_Skeleton
{
};
class Agent_Provider : public KALDERA_AgentService_Skeleton
{
public:
    const KALDERA_AgentService* called_on = nullptr;

    Invoke_Method_Status executeMethod(const KALDERA_AgentService* self, Property<String>& response,
                                       const Property<String>& request, Property<uint32>& return_value)
    {
        called_on = self;
        response.set(String("answer to ", request.value.c_str()));
        return_value.set(7);
        return INVOKE_METHOD_OK;
    }
};

/// What a handler proc was given: instances, then the end mark with its status.
struct Received
{
    int instances = 0;
    int end_marks = 0;
    int end_status = -1;

    static bool proc(Instance* instance, int status, void* client_data)
    {
        auto* received = static_cast<Received*>(client_data);
        if (instance) {
            received->instances++;
            unref(instance);
            return true;
        }
        received->end_marks++;
        received->end_status = status;
        return false;
    }
};

/// Through a call that is never inlined, as the module's dispatchers are reached.
template <class Provider>
[[gnu::noipa]] int call(int operation, void* a0 = nullptr, void* a1 = nullptr, void* a2 = nullptr,
                        void* a3 = nullptr, void* a4 = nullptr, void* a5 = nullptr, void* a6 = nullptr)
{
    return dispatch<Provider>(nullptr, operation, a0, a1, a2, a3, a4, a5, a6, nullptr);
}

/// A provider of its own, made and destroyed by its dispatcher.
template <class Provider>
struct Loaded
{
    void* provider = nullptr;

    Loaded() { EXPECT_EQ(call<Provider>(OP_CREATE_PROVIDER, &provider), 0); }
    ~Loaded() { EXPECT_EQ(call<Provider>(OP_DESTROY_PROVIDER, provider), 0); }
};

void* handler_proc()
{
    return reinterpret_cast<void*>(&Received::proc);
}

template <class Provider>
void expect_common_operations()
{
    Loaded<Provider> p;
    EXPECT_EQ(call<Provider>(OP_LOAD, p.provider), 0);
    EXPECT_EQ(call<Provider>(OP_UNLOAD, p.provider), 0);
    const Meta_Class* meta_class = nullptr;
    EXPECT_EQ(call<Provider>(OP_GET_META_CLASS, &meta_class), 0);
    EXPECT_EQ(meta_class, &Provider::Class::static_meta_class);
    const Meta_Repository* repository = nullptr;
    EXPECT_EQ(call<Provider>(OP_GET_REPOSITORY, &repository), 0);
    EXPECT_EQ(repository, meta_class->meta_repository);
    EXPECT_EQ(call<Provider>(OP_DESTROY_PROVIDER, nullptr), 0);
    EXPECT_EQ(call<Provider>(17, p.provider), -1);
    EXPECT_EQ(call<Provider>(-1, p.provider), -1);
}

template <class Provider>
void expect_unsupported_instance_operations()
{
    Loaded<Provider> p;
    using Class = typename Provider::Class;
    auto* const model = create<Class>(true);
    Instance* found = nullptr;
    EXPECT_EQ(call<Provider>(OP_GET_INSTANCE, p.provider, model, &found), 61);
    EXPECT_EQ(found, nullptr);
    EXPECT_EQ(call<Provider>(OP_CREATE_INSTANCE, p.provider, model), 81);
    EXPECT_EQ(call<Provider>(OP_DELETE_INSTANCE, p.provider, model), 91);
    EXPECT_EQ(call<Provider>(OP_MODIFY_INSTANCE, p.provider, model, model), 101);
    Received received;
    EXPECT_EQ(call<Provider>(OP_ENUM_INSTANCES, p.provider, model, handler_proc(), &received), 0);
    EXPECT_EQ(received.instances, 0);
    EXPECT_EQ(received.end_marks, 1);
    EXPECT_EQ(received.end_status, 0);
    unref(model);
}

template <class Provider, class Record>
int invoke(void* provider, Instance* self)
{
    Instance* const record = create(&Record::static_meta_class);
    const int status = call<Provider>(OP_INVOKE_METHOD, provider, self, record);
    unref(record);
    return status;
}

TEST(Skeleton, OfAnInstanceProvider)
{
    expect_common_operations<Port_Provider>();
    expect_unsupported_instance_operations<Port_Provider>();
    Loaded<Port_Provider> p;
    for (const int operation : {11, 12, 14, 15, 16})
        EXPECT_EQ(call<Port_Provider>(operation, p.provider), -1) << operation;
}

TEST(Skeleton, OfAnAssociationProvider)
{
    expect_common_operations<Collection_Provider>();
    expect_unsupported_instance_operations<Collection_Provider>();
    Loaded<Collection_Provider> p;
    for (const int operation : {10, 11, 12})
        EXPECT_EQ(call<Collection_Provider>(operation, p.provider), -1) << operation;
}

// An unsupported answer sends no end mark: the caller falls back and sends its own.
TEST(Skeleton, AssociationOperationsAreUnsupportedWithoutAnEndMark)
{
    Loaded<Collection_Provider> p;
    String empty;
    Received received;
    auto* const instance = create<KALDERA_FCPort>(true);
    auto* const model = create<KALDERA_HostedCollection>(true);
    EXPECT_EQ(call<Collection_Provider>(OP_ENUM_ASSOCIATOR_NAMES, p.provider, instance, &empty, &empty,
                                        &empty, handler_proc(), &received),
              111);
    EXPECT_EQ(call<Collection_Provider>(OP_ENUM_REFERENCES, p.provider, instance, model, &empty,
                                        handler_proc(), &received),
              121);
    EXPECT_EQ(call<Collection_Provider>(OP_ENUM_ASSOCIATORS, p.provider, instance, &empty, &empty, &empty,
                                        handler_proc(), &received),
              171);
    EXPECT_EQ(received.instances, 0);
    EXPECT_EQ(received.end_marks, 0);
    unref(instance);
    unref(model);
}

TEST(Skeleton, OfAnIndicationProvider)
{
    expect_common_operations<Alert_Provider>();
    Loaded<Alert_Provider> p;
    for (const int operation : {5, 6, 7, 8, 9, 10, 14, 15, 16})
        EXPECT_EQ(call<Alert_Provider>(operation, p.provider), -1) << operation;
    // The handler that dispatch makes is not leaked by a provider that does nothing with it.
    EXPECT_EQ(call<Alert_Provider>(OP_ENABLE_INDICATIONS, p.provider, nullptr, nullptr), 140);
    EXPECT_EQ(call<Alert_Provider>(OP_DISABLE_INDICATIONS, p.provider), 150);
}

TEST(Skeleton, EveryMethodOfAClassIsUnsupported)
{
    Loaded<Port_Provider> p;
    uint32 methods = 0;
    const Meta_Class& meta_class = KALDERA_FCPort::static_meta_class;
    for (uint32 i = 0; i < meta_class.num_meta_features; i++) {
        if (!(meta_class.meta_features[i]->flags & FLAG_METHOD))
            continue;
        methods++;
        Instance* const record = create(static_cast<const Meta_Method*>(meta_class.meta_features[i]));
        EXPECT_EQ(call<Port_Provider>(OP_INVOKE_METHOD, p.provider, nullptr, record), 131)
            << meta_class.meta_features[i]->name;
        unref(record);
    }
    EXPECT_EQ(methods, 8u);
}

TEST(Skeleton, AMethodOfAnotherClassIsNotKnown)
{
    Loaded<Port_Provider> p;
    EXPECT_EQ((invoke<Port_Provider, KALDERA_AgentService_executeMethod_method>(p.provider, nullptr)), -1);
}

TEST(Skeleton, AnImplementedMethodGetsTheCellsOfItsRecord)
{
    Loaded<Agent_Provider> p;
    using Record = KALDERA_AgentService_executeMethod_method;
    auto* const self = create<KALDERA_AgentService>(true);
    auto* const record = static_cast<Record*>(create(&Record::static_meta_class));
    record->request.set("question");
    EXPECT_EQ(call<Agent_Provider>(OP_INVOKE_METHOD, p.provider, self, record), 0);
    EXPECT_EQ(static_cast<Agent_Provider*>(p.provider)->called_on, self);
    EXPECT_STREQ(record->response.value.c_str(), "answer to question");
    EXPECT_EQ(record->return_value.value, 7u);
    unref(record);
    unref(self);
}

// The reference is cast with a test: an instance of another class arrives as null.
TEST(Skeleton, AMethodOnAnInstanceOfAnotherClassGetsNull)
{
    Loaded<Agent_Provider> p;
    auto* const other = create<KALDERA_FCPort>(true);
    EXPECT_EQ((invoke<Agent_Provider, KALDERA_AgentService_executeMethod_method>(p.provider, other)), 0);
    EXPECT_EQ(static_cast<Agent_Provider*>(p.provider)->called_on, nullptr);
    unref(other);
}

TEST(Skeleton, MethodNamesAreComparedWithoutCase)
{
    Loaded<Agent_Provider> p;
    using Record = KALDERA_AgentService_executeMethod_method;
    Meta_Method shouting = Record::static_meta_class;
    shouting.name = "EXECUTEMETHOD";
    Instance* const record = create(&shouting);
    EXPECT_EQ(call<Agent_Provider>(OP_INVOKE_METHOD, p.provider, nullptr, record), 0);
    unref(record);
}

// The record of an overriding method is the one of the nearest class, with its own parameters.
TEST(Skeleton, AnOverriddenMethodIsListedOnce)
{
    const Meta_Feature* method =
        find_feature(&KALDERA_ConcreteJob::static_meta_class, "RequestStateChange", FLAG_METHOD);
    EXPECT_EQ(method, &KALDERA_ConcreteJob_RequestStateChange_method::static_meta_class);
}

// What goes in only is read-only; what goes out is the record's own cell. A provider that states other types
// does not compile.
static_assert(std::is_same_v<decltype(&KALDERA_FCPort_Skeleton::RequestStateChange),
                             Invoke_Method_Status (KALDERA_FCPort_Skeleton::*)(
                                 const KALDERA_FCPort*, const Property<uint16>&, CIM_ConcreteJob*&,
                                 const Property<Datetime>&, Property<uint32>&)>);
static_assert(
    std::is_same_v<decltype(&KALDERA_ConcreteJob_Skeleton::GetErrors),
                   Invoke_Method_Status (KALDERA_ConcreteJob_Skeleton::*)(
                       const KALDERA_ConcreteJob*, Property<Array<Instance*>>&, Property<uint32>&)>);
static_assert(std::is_same_v<decltype(KALDERA_HostedCollection::Dependent), CIM_SystemSpecificCollection*>);

} // namespace
