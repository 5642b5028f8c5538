#include "module/runtime/objects/Container.h"

#include "tests/module/runtime/objects/sample_values.h"
#include "tests/support/Live_Blocks.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

namespace KPRV {

namespace {

/// A bag in memory that can be told which names fail.
class Bag : public Container
{
public:
    struct Item
    {
        std::string name;
        Value value;
        uint32 flags = 0;
    };

    Bag() : Container(&sample_repository) {}

    uint32 get_size() override { return static_cast<uint32>(items.size()); }
    int get_name(uint32 index, String& name) override
    {
        name = items[index].name.c_str();
        return nameless.count(index) ? -1 : 0;
    }
    int get_value(uint32 index, Value::Type type, Value& value) override
    {
        asked.push_back(items[index].name + " as " + name_of(type));
        value = items[index].value;
        return failing.count(items[index].name) ? -1 : 0;
    }
    int set_value(const char* name, const Value& value, uint32 flags) override
    {
        items.push_back({name, value, flags});
        return failing.count(name) ? -1 : 0;
    }

    template <class T>
    void add(const char* name, const T& x)
    {
        items.push_back({name, Value(), 0});
        items.back().value.set_value(x);
    }
    std::vector<std::string> names() const
    {
        std::vector<std::string> result;
        for (const Item& item : items)
            result.push_back(item.name);
        return result;
    }
    const Meta_Repository* repository() const { return _repository; }

    std::vector<Item> items;
    std::vector<std::string> asked;
    std::set<std::string> failing;
    std::set<uint32> nameless;
};

using Names = std::vector<std::string>;

/// The result of an import, released at the end.
template <class T>
Ref<T> import(Bag& bag, uint32 mask)
{
    Instance* result = nullptr;
    EXPECT_EQ(0, bag.convert(&T::static_meta_class, mask, result));
    return Ref<T>(static_cast<T*>(result));
}

} // namespace

TEST(Container, KeepsItsRepository)
{
    EXPECT_EQ(&sample_repository, Bag().repository());
}

TEST(Container_export, GivesEachFeatureWithAValueInClassOrder)
{
    const Ref<Sample_Port> port(make_port("p", 1));
    port->Caption.null = 1;
    port->Words.null = 1;
    Bag bag;
    EXPECT_EQ(0, bag.convert(port.ptr(), 0));
    EXPECT_EQ((Names{"Name", "EnabledState", "Timeout", "Codes", "Pauses", "Number"}), bag.names());
    EXPECT_EQ(_Sample_Port_Number.flags, bag.items[5].flags);
    uint64 number = 0;
    EXPECT_EQ(0, bag.items[5].value.get_value(number));
    EXPECT_EQ(1u, number);
    for (const Bag::Item& item : bag.items)
        EXPECT_FALSE(item.value.null);
}

TEST(Container_export, References)
{
    const Ref<Sample_Group> group = make_group("g");
    Bag bag;
    EXPECT_EQ(0, bag.convert(group.ptr(), 0));
    EXPECT_EQ((Names{"Name", "Leader", "Members"}), bag.names());
    EXPECT_EQ(2, group->Leader->__refs);
    bag.items.clear();
    clear(group.ptr());
    EXPECT_EQ(0, bag.convert(group.ptr(), 0));
    EXPECT_EQ(Names{}, bag.names());
    // An array of references that is empty, but not null, is a value.
    group->Members.null = 0;
    EXPECT_EQ(0, bag.convert(group.ptr(), 0));
    EXPECT_EQ((Names{"Members"}), bag.names());
}

TEST(Container_export, AMaskChooses)
{
    const Ref<Sample_Port> port(make_port("p", 1));
    Bag keys;
    EXPECT_EQ(0, keys.convert(port.ptr(), FLAG_KEY));
    EXPECT_EQ((Names{"Name", "Number"}), keys.names());
    const Ref<Instance> call(create(&Sample_Element_Reset_method::static_meta_class));
    Bag out;
    EXPECT_EQ(0, out.convert(call.ptr(), FLAG_OUT));
    EXPECT_EQ((Names{"Count", "Message", "return_value"}), out.names());
}

TEST(Container_export, LeavesANullKeyOut)
{
    const Ref<Sample_Port> port(make_port("p", 1));
    port->Name.null = 1;
    Bag bag;
    EXPECT_EQ(0, bag.convert(port.ptr(), FLAG_KEY));
    EXPECT_EQ((Names{"Number"}), bag.names());
}

TEST(Container_export, LogsWhatTheContainerRefusesAndGoesOn)
{
    const Log_Capture log;
    const Ref<Sample_Port> port(make_port("p", 1));
    Bag bag;
    bag.failing = {"EnabledState"};
    EXPECT_EQ(0, bag.convert(port.ptr(), 0));
    EXPECT_EQ("Number", bag.names().back());
    EXPECT_EQ((Lines{"WARN conversion error: Sample_Port.EnabledState"}), log.said());
}

TEST(Container_export, NeedsAnInstance)
{
    const Log_Capture log;
    Bag bag;
    EXPECT_EQ(-1, bag.convert(nullptr, 0));
    EXPECT_EQ((Lines{"WARN ignored null instance arg"}), log.said());
    EXPECT_EQ("Container.cpp", log.lines().at(0).file);
}

TEST(Container_import, FillsANewInstanceAndLeavesTheRestNull)
{
    Bag bag;
    bag.add("NUMBER", uint64(7));
    bag.add("words", sample_array<String>(0));
    const Ref<Sample_Port> port = import <Sample_Port>(bag, 0);
    EXPECT_EQ(7u, port->Number.value);
    EXPECT_EQ(0, port->Number.null);
    EXPECT_TRUE(port->Words.value == sample_array<String>(0));
    EXPECT_EQ(0, port->Words.null);
    EXPECT_EQ(1, port->Name.null);
    // No defaults.
    EXPECT_EQ(1, port->EnabledState.null);
    EXPECT_EQ(0, port->EnabledState.value);
    EXPECT_EQ((Names{"NUMBER as uint64", "words as string_array"}), bag.asked);
}

TEST(Container_import, LosesNothingWhereThereIsNoMemory)
{
    Bag bag;
    bag.add("Name", "longer than what a text holds without a block");
    bag.add("Words", sample_array<String>(0));
    bag.add("Caption", "another one");
    EXPECT_EQ("", lost_without_a_block([&] { import <Sample_Port>(bag, 0); }, [&] { bag.asked.clear(); }));
}

TEST(Container_import, IntoAnInstanceNullsWhatIsNotNamed)
{
    Bag bag;
    bag.add("Number", uint64(7));
    const Ref<Sample_Port> port(make_port("p", 1));
    Instance* instance = port.ptr();
    EXPECT_EQ(0, bag.convert(instance->__meta_class, 0, instance));
    EXPECT_EQ(port.ptr(), instance);
    EXPECT_EQ(7u, port->Number.value);
    EXPECT_EQ(1, port->Name.null);
    EXPECT_EQ(1, port->EnabledState.null);
}

TEST(Container_import, ToleratesNamesThatTheClassDoesNotKnow)
{
    const Log_Capture log;
    Bag bag;
    bag.add("Nothing", uint8(1));
    bag.add("Reset", uint8(1));
    bag.add("Number", uint64(7));
    const Ref<Sample_Port> port = import <Sample_Port>(bag, 0);
    EXPECT_EQ(7u, port->Number.value);
    EXPECT_EQ((Lines{"WARN unknown feature: Sample_Port.Nothing", "WARN unknown feature: Sample_Port.Reset"}),
              log.said());
}

TEST(Container_import, AMaskSkipsSilently)
{
    const Log_Capture log;
    Bag bag;
    bag.add("Name", "p");
    bag.add("EnabledState", uint16(3));
    const Ref<Sample_Port> port = import <Sample_Port>(bag, FLAG_KEY);
    EXPECT_STREQ("p", port->Name.value.c_str());
    EXPECT_EQ(1, port->EnabledState.null);
    EXPECT_EQ((Names{"Name as string"}), bag.asked);
    EXPECT_EQ(Lines{}, log.said());
}

TEST(Container_import, LogsEachFailureAndGoesOn)
{
    const Log_Capture log;
    Bag bag;
    bag.add("Caption", "lost");
    bag.add("EnabledState", uint32(3));
    bag.add("Name", "p");
    bag.add("Load", real64(1));
    bag.add("Number", uint64(7));
    bag.nameless = {0};
    bag.failing = {"Load"};
    const Ref<Sample_Port> port = import <Sample_Port>(bag, 0);
    EXPECT_STREQ("p", port->Name.value.c_str());
    EXPECT_EQ(7u, port->Number.value);
    EXPECT_EQ(1, port->EnabledState.null);
    EXPECT_EQ(1, port->Load.null);
    EXPECT_EQ(
        (Lines{"WARN get_name() failed: class=Sample_Port, index=0",
               "WARN type mismatch: Sample_Port.EnabledState",
               "WARN conversion error: Sample_Port.EnabledState", "WARN conversion error: Sample_Port.Load"}),
        log.said());
}

TEST(Container_import, TakesNullValues)
{
    Bag bag;
    bag.add("Name", "p");
    bag.items[0].value.set_null(static_cast<Value::Type>(STRING));
    const Ref<Sample_Port> port = import <Sample_Port>(bag, 0);
    EXPECT_EQ(1, port->Name.null);
}

// A server may name a property twice: the last one stands, and nothing is lost.
TEST(Container_import, GivesBackWhatAReferenceHeldBefore)
{
    const Ref<Sample_Group> first = make_group("a");
    const Ref<Sample_Group> second = make_group("b");
    {
        Bag bag;
        EXPECT_EQ(0, bag.convert(first.ptr(), 0));
        EXPECT_EQ(0, bag.convert(second.ptr(), 0));
        const Ref<Sample_Group> group = import <Sample_Group>(bag, 0);
        EXPECT_EQ(second->Leader, group->Leader);
    }
    for (const Ref<Sample_Group>& group : {first, second}) {
        EXPECT_EQ(1, group->Leader->__refs);
        EXPECT_EQ(1, group->Members.value[0]->__refs);
    }
}

TEST(Container, RoundTripOfEveryType)
{
    const Ref<Sample_Types> from = make_types(1);
    Bag bag;
    EXPECT_EQ(0, bag.convert(from.ptr(), 0));
    EXPECT_EQ(1u + 2 * NUM_TYPES, bag.get_size());
    const Ref<Sample_Types> to = import <Sample_Types>(bag, 0);
    EXPECT_TRUE(identical(from.ptr(), to.ptr()));
}

TEST(Container, RoundTripOfReferencesSharesTheTargets)
{
    const Ref<Sample_Group> from = make_group("g");
    const Ref<Sample_Group> to = [&] {
        Bag bag;
        EXPECT_EQ(0, bag.convert(from.ptr(), 0));
        return import <Sample_Group>(bag, 0);
    }();
    EXPECT_TRUE(identical(from.ptr(), to.ptr()));
    EXPECT_EQ(from->Leader, to->Leader);
    EXPECT_EQ(2, from->Leader->__refs);
    EXPECT_EQ(2, from->Members.value[0]->__refs);
}

} // namespace KPRV
