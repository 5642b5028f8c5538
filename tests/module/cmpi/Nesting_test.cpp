// References in references in references: what is too deep is left out, and what cannot be kept is not taken
// apart, on a thread with as small a stack as servers have.
#include "module/cmpi/Converter.h"
#include "module/cmpi/to_cimple_instance.h"
#include "module/cmpi/to_cimple_value.h"
#include "module/cmpi/to_cmpi_data.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"
#include "tests/support/Small_Stack.h"

#include <cmpimacs.h>

using namespace KPRV;

namespace {

extern const Meta_Repository boxes;

/// Holds another of its kind: in its name, as a property, and as an array of them.
struct Box : Instance
{
    Property<String> Name;
    Instance* Inside;
    Instance* Content;
    Property<Array<Instance*>> Contents;
    static const Meta_Class static_meta_class;
};

constexpr uint32 EMBEDDED = FLAG_REFERENCE | FLAG_EMBEDDED_INSTANCE;
constexpr Meta_Property box_name = {
    {{0, FLAG_PROPERTY | FLAG_KEY, "Name", nullptr, 0}}, STRING, 0, offsetof(Box, Name), nullptr};
constexpr Meta_Reference box_inside = {{{0, FLAG_REFERENCE | FLAG_KEY, "Inside", nullptr, 0}},
                                       0,
                                       &Box::static_meta_class,
                                       offsetof(Box, Inside)};
constexpr Meta_Reference box_content = {
    {{0, EMBEDDED, "Content", nullptr, 0}}, 0, &Box::static_meta_class, offsetof(Box, Content)};
constexpr Meta_Reference box_contents = {
    {{0, EMBEDDED, "Contents", nullptr, 0}}, -1, &Box::static_meta_class, offsetof(Box, Contents)};
constexpr const Meta_Feature* box_features[] = {&box_name, &box_inside, &box_content, &box_contents};
} // namespace
constexpr Meta_Class Box::static_meta_class = {
    {{0, FLAG_CLASS, "Box", nullptr, 0}}, box_features, 4, sizeof(Box), nullptr, nullptr, 2, &boxes};
namespace {

/// Fits in no box.
struct Sack : Instance
{
    Property<String> Name;
    Instance* Inside;
    static const Meta_Class static_meta_class;
};
constexpr Meta_Property sack_name = {
    {{0, FLAG_PROPERTY | FLAG_KEY, "Name", nullptr, 0}}, STRING, 0, offsetof(Sack, Name), nullptr};
constexpr Meta_Reference sack_inside = {{{0, FLAG_REFERENCE | FLAG_KEY, "Inside", nullptr, 0}},
                                        0,
                                        &Sack::static_meta_class,
                                        offsetof(Sack, Inside)};
constexpr const Meta_Feature* sack_features[] = {&sack_name, &sack_inside};
} // namespace
constexpr Meta_Class Sack::static_meta_class = {
    {{0, FLAG_CLASS, "Sack", nullptr, 0}}, sack_features, 2, sizeof(Sack), nullptr, nullptr, 2, &boxes};
namespace {

constexpr const Meta_Class* box_classes[] = {&Box::static_meta_class, &Sack::static_meta_class};
constexpr Meta_Repository boxes = {box_classes, 2};

constexpr unsigned MOST = 64;
constexpr unsigned FAR_TOO_DEEP = 400;
/// The server's own way of taking arrays apart is what would end the thread beyond.
constexpr unsigned FAR_TOO_DEEP_IN_ARRAYS = 200;
const Texts TOO_DEEP = {"ERR references nested deeper than 64 levels"};

/// Every level of the nested values, until a test ends: to take one apart at once needs more stack than a
/// request has.
std::vector<broker::Plain_Value> levels;

/// A path with so many others in it, each in a key of the one around it.
broker::Path_Value nested_path(unsigned depth, const char* class_name = "Box")
{
    broker::Path_Value path = path_of(class_name, "innermost");
    for (; depth > 0; depth--) {
        broker::Path_Value around = path_of(class_name, "around");
        levels.push_back(broker::Plain_Value::path(std::move(path)));
        around.keys.push_back({"Inside", levels.back()});
        path = std::move(around);
    }
    return path;
}

/// The same of instances, in a property or in arrays.
broker::Instance_Value nested_instance(unsigned depth, bool in_arrays)
{
    broker::Instance_Value instance{path_of("Box", "i"), {}};
    for (; depth > 0; depth--) {
        broker::Instance_Value around{path_of("Box", "i"), {}};
        levels.push_back(broker::Plain_Value::instance(std::move(instance)));
        if (in_arrays)
            around.properties.push_back(
                {"Contents", broker::Plain_Value::array(CMPI_instance, {levels.back()})});
        else
            around.properties.push_back({"Content", levels.back()});
        instance = std::move(around);
    }
    return instance;
}

enum class By
{
    KEY,
    PROPERTY,
    ARRAY
};

const Box* inner(const Box& box, By by)
{
    const Instance* const next = by == By::KEY                                     ? box.Inside
                                 : by == By::PROPERTY                              ? box.Content
                                 : box.Contents.null || box.Contents.value.empty() ? nullptr
                                                                                   : box.Contents.value[0];
    return static_cast<const Box*>(next);
}

unsigned depth_of(const Instance* instance, By by)
{
    unsigned depth = 0;
    for (const Box* box = static_cast<const Box*>(instance); (box = inner(*box, by)); depth++)
        continue;
    return depth;
}

Ref<Box> nested_box(unsigned depth, By by)
{
    Ref<Box> box(create<Box>(true));
    box->Name.set("innermost");
    for (; depth > 0; depth--) {
        Ref<Box> around(create<Box>(true));
        around->Name.set("around");
        if (by == By::KEY)
            around->Inside = box.steal();
        else if (by == By::PROPERTY)
            around->Content = box.steal();
        else
            around->Contents.set(Array<Instance*>(std::initializer_list<Instance*>{box.steal()}.begin(), 1));
        box = around;
    }
    return box;
}

class Nested_References : public testing::Test
{
protected:
    ~Nested_References() override { levels.clear(); }

    template <class Body>
    void on_request_thread(Body body)
    {
        on_small_stack([&] {
            const broker::Mi_Frame request(server.broker, {});
            body();
        });
    }
    /// Into an instance, as a request comes in.
    unsigned imported(const broker::Path_Value& path)
    {
        const broker::Argument<broker::Path_Object> object(*server.core, path);
        Ref<Instance> instance;
        EXPECT_EQ(CMPI_RC_OK,
                  make_cimple_reference(nullptr, &Box::static_meta_class, object.cmpi(), instance));
        return depth_of(instance.ptr(), By::KEY);
    }
    unsigned imported(const broker::Instance_Value& value, By by)
    {
        const broker::Argument<broker::Instance_Object> object(*server.core, value);
        const broker::Argument<broker::Path_Object> path(*server.core, value.path);
        Ref<Instance> instance;
        EXPECT_EQ(CMPI_RC_OK, make_cimple_instance(nullptr, &Box::static_meta_class, path.cmpi(),
                                                   object.cmpi(), instance));
        return depth_of(instance.ptr(), by);
    }
    /// To the server, and what it holds then.
    unsigned exported_path(const Instance* instance)
    {
        CMPIObjectPath* path = nullptr;
        EXPECT_EQ(CMPI_RC_OK,
                  make_cmpi_object_path(server.broker.cmpi(), instance, NAME_SPACE, path, nullptr));
        unsigned depth = 0;
        for (CMPIStatus rc = {}; path; depth++) {
            const CMPIData inside = path->ft->getKey(path, "Inside", &rc);
            path = rc.rc == CMPI_RC_OK && !(inside.state & CMPI_nullValue) ? inside.value.ref : nullptr;
        }
        return depth - 1;
    }
    unsigned exported_instance(const Instance* instance, By by)
    {
        CMPIInstance* object = nullptr;
        const broker::Argument<broker::Path_Object> path(*server.core, path_of("Box", "b"));
        EXPECT_EQ(CMPI_RC_OK, make_cmpi_instance(server.broker.cmpi(), instance, NAME_SPACE, path.cmpi(),
                                                 nullptr, object, nullptr));
        unsigned depth = 0;
        for (CMPIStatus rc = {}; object; depth++) {
            CMPIData next = object->ft->getProperty(object, by == By::ARRAY ? "Contents" : "Content", &rc);
            const bool is_there = rc.rc == CMPI_RC_OK && !(next.state & CMPI_nullValue);
            if (by == By::ARRAY)
                next = is_there && CMGetArrayCount(next.value.array, nullptr) > 0
                           ? CMGetArrayElementAt(next.value.array, 0, nullptr)
                           : CMPIData{};
            object = is_there ? next.value.inst : nullptr;
        }
        return depth - 1;
    }
    /// What is said besides that a conversion failed, once for each feature around the one that is too deep.
    Texts said()
    {
        Texts lines = log.said();
        std::erase_if(lines, [](const std::string& line) { return !line.starts_with("ERR "); });
        log.clear();
        return lines;
    }

    Test_Server server;
    Log_Capture log;
};

TEST_F(Nested_References, OfPathsComeInUpToABound)
{
    on_request_thread([&] {
        EXPECT_EQ(0u, imported(nested_path(0)));
        EXPECT_EQ(MOST, imported(nested_path(MOST)));
        EXPECT_EQ(Texts{}, log.said());
        EXPECT_EQ(MOST, imported(nested_path(MOST + 1)));
        EXPECT_EQ(
            (Texts{"ERR references nested deeper than 64 levels", "WARN failed to create CIMPLE instance",
                   "WARN cmpi_to_cimple_value() failed", "WARN conversion error: Box.Inside"}),
            log.said())
            << "the feature that is too deep fails, and no other";
        log.clear();
        EXPECT_EQ(MOST, imported(nested_path(FAR_TOO_DEEP)));
        EXPECT_EQ(TOO_DEEP, said());
    });
}

TEST_F(Nested_References, OfInstancesComeInUpToABound)
{
    on_request_thread([&] {
        for (const By by : {By::PROPERTY, By::ARRAY}) {
            EXPECT_EQ(MOST, imported(nested_instance(MOST, by == By::ARRAY), by));
            EXPECT_EQ(Texts{}, log.said());
            // An array with an element that fails, fails.
            EXPECT_EQ(MOST, imported(nested_instance(MOST + 1, by == By::ARRAY), by));
            EXPECT_EQ(TOO_DEEP, said());
            const unsigned far = by == By::ARRAY ? FAR_TOO_DEEP_IN_ARRAYS : FAR_TOO_DEEP;
            EXPECT_EQ(MOST, imported(nested_instance(far, by == By::ARRAY), by));
            EXPECT_EQ(TOO_DEEP, said());
        }
    });
}

TEST_F(Nested_References, GoOutUpToABound)
{
    on_request_thread([&] {
        for (const unsigned depth : {MOST, MOST + 1, FAR_TOO_DEEP_IN_ARRAYS}) {
            EXPECT_EQ(MOST, exported_path(nested_box(depth, By::KEY).ptr()));
            EXPECT_EQ(depth > MOST ? TOO_DEEP : Texts{}, said());
            for (const By by : {By::PROPERTY, By::ARRAY}) {
                EXPECT_EQ(MOST, exported_instance(nested_box(depth, by).ptr(), by));
                EXPECT_EQ(depth > MOST ? TOO_DEEP : Texts{}, said());
            }
        }
    });
}

TEST_F(Nested_References, AreNotTakenApartForAFeatureThatHoldsNone)
{
    const broker::Mi_Frame request(server.broker, {});
    broker::Path_Value path = path_of("Box", "b");
    path.keys[0].value = broker::Plain_Value::path(nested_path(FAR_TOO_DEEP));
    imported(path);
    EXPECT_EQ((Texts{"WARN type mismatch on Name: instance/string", "WARN conversion error: Box.Name"}),
              log.said());
    log.clear();
    path = path_of("Box", "b");
    path.keys.push_back({"Unknown", broker::Plain_Value::path(nested_path(FAR_TOO_DEEP))});
    imported(path);
    EXPECT_EQ(Texts{"WARN unknown feature: Box.Unknown"}, log.said());
    log.clear();
    broker::Instance_Value instance{path_of("Box", "b"), {}};
    instance.properties.push_back(
        {"Contents", broker::Plain_Value::instance(nested_instance(FAR_TOO_DEEP, false))});
    imported(instance, By::ARRAY);
    EXPECT_EQ((Texts{"WARN type mismatch on Contents: instance/instance_array",
                     "WARN conversion error: Box.Contents"}),
              log.said());
}

TEST_F(Nested_References, ToWhatDoesNotFitAreNotTakenApart)
{
    const broker::Mi_Frame request(server.broker, {});
    broker::Path_Value path = path_of("Box", "b");
    std::vector<std::string> calls[2];
    for (const unsigned depth : {0u, FAR_TOO_DEEP}) {
        path.keys.resize(1);
        path.keys.push_back({"Inside", broker::Plain_Value::path(nested_path(depth, "Sack"))});
        server.calls();
        EXPECT_EQ(0u, imported(path));
        calls[depth > 0] = server.calls();
        EXPECT_EQ((Texts{"WARN failed to assign instance of Sack to Box.Inside",
                         "WARN conversion error: Box.Inside"}),
                  log.said());
        log.clear();
    }
    EXPECT_EQ(calls[0], calls[1]);
}

} // namespace
