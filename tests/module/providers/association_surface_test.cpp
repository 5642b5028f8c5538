#include "tests/module/providers/Association_Fixture.h"

#include <set>

namespace KPRV {
namespace {

class Association_Surface : public Association_Fixture
{
protected:
    static int call(const Registration* provider, int operation, std::vector<void*> arguments = {})
    {
        arguments.resize(7);
        void* object = nullptr;
        provider->proc(provider, OP_CREATE_PROVIDER, &object, nullptr, nullptr, nullptr, nullptr, nullptr,
                       nullptr, nullptr);
        const int status =
            provider->proc(provider, operation, object, arguments[0], arguments[1], arguments[2],
                           arguments[3], arguments[4], arguments[5], arguments[6]);
        provider->proc(provider, OP_DESTROY_PROVIDER, object, nullptr, nullptr, nullptr, nullptr, nullptr,
                       nullptr, nullptr);
        return status;
    }
};

TEST_F(Association_Surface, LeavesAllButTheEnumerationToTheModule)
{
    // An unsupported answer sends no end mark.
    static bool marked;
    marked = false;
    const Instance_Handler_Proc handler = [](Instance*, int, void*) { return marked = true; };
    void* const proc = reinterpret_cast<void*>(handler);
    String none;
    size_t count = 0;
    for (const Registration* each = _cimple_registration_head; each; each = each->next) {
        if (!(each->meta_class->flags & FLAG_ASSOCIATION))
            continue;
        SCOPED_TRACE(each->provider_name);
        count++;
        const Ref<Instance> model(create(each->meta_class, true));
        Instance* found = nullptr;
        EXPECT_EQ(0, call(each, OP_LOAD));
        EXPECT_EQ(0, call(each, OP_UNLOAD));
        EXPECT_EQ(61, call(each, OP_GET_INSTANCE, {model.ptr(), &found}));
        EXPECT_EQ(nullptr, found);
        EXPECT_EQ(81, call(each, OP_CREATE_INSTANCE, {model.ptr()}));
        EXPECT_EQ(91, call(each, OP_DELETE_INSTANCE, {model.ptr()}));
        EXPECT_EQ(101, call(each, OP_MODIFY_INSTANCE, {model.ptr(), model.ptr()}));
        EXPECT_EQ(-1, call(each, OP_INVOKE_METHOD, {model.ptr(), model.ptr()}));
        EXPECT_EQ(111, call(each, OP_ENUM_ASSOCIATOR_NAMES, {model.ptr(), &none, &none, &none, proc}));
        EXPECT_EQ(171, call(each, OP_ENUM_ASSOCIATORS, {model.ptr(), &none, &none, &none, proc}));
        EXPECT_EQ(121, call(each, OP_ENUM_REFERENCES, {model.ptr(), model.ptr(), &none, proc}));
    }
    EXPECT_EQ(41u, count);
    EXPECT_FALSE(marked);
    EXPECT_TRUE(managers_script.fetched.empty());
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Association_Surface, SetsNothingButTheEnds)
{
    lists("PortController: a; tests for adapters: t");
    const Registration* provider = registration("AvailableDiagnosticServiceForAdapter");
    static bool as_created;
    as_created = false;
    const Instance_Handler_Proc handler = [](Instance* instance, int, void*) {
        if (instance) {
            const Ref<Instance> fresh(create(instance->__meta_class, true));
            as_created = true;
            for (const Meta_Feature* feature : features_of(instance->__meta_class)) {
                if (!(feature->flags & FLAG_PROPERTY))
                    continue;
                const auto* property = static_cast<const Meta_Property*>(feature);
                as_created &= property_eq(property, &cell_at<char>(instance, property->offset),
                                          &cell_at<char>(fresh.ptr(), property->offset));
            }
        }
        destroyer(instance);
        return true;
    };
    call(provider, OP_ENUM_INSTANCES, {nullptr, reinterpret_cast<void*>(handler)});
    EXPECT_TRUE(as_created);
}

} // namespace
} // namespace KPRV
