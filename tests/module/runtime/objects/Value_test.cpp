#include "module/runtime/objects/Value.h"

#include "module/runtime/objects/Lent_Value.h"
#include "tests/module/runtime/objects/sample_values.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <cstring>
#include <utility>

namespace KPRV {

namespace {

constexpr auto LEADER = &_Sample_Group_Leader;
constexpr auto MEMBERS = &_Sample_Group_Members;
constexpr auto RESET = &Sample_Element_Reset_method::static_meta_class;

template <class T>
constexpr Value::Type TYPE_OF = static_cast<Value::Type>(Type_Code<T>::value);
template <class T>
constexpr Value::Type ARRAY_TYPE_OF = static_cast<Value::Type>(128 + Type_Code<T>::value);

template <class T>
class Value_Typed_Test : public testing::Test
{
protected:
    /// The records of the scalar and the array of the type in `Sample_Types`.
    static const Meta_Property* scalar()
    {
        return static_cast<const Meta_Property*>(_Sample_Types_MFA[1 + 2 * Type_Code<T>::value]);
    }
    static const Meta_Property* array()
    {
        return static_cast<const Meta_Property*>(_Sample_Types_MFA[2 + 2 * Type_Code<T>::value]);
    }
    static Property<T>& scalar_of(const Ref<Sample_Types>& x)
    {
        return cell_at<Property<T>>(x.ptr(), scalar()->offset);
    }
    static Property<Array<T>>& array_of(const Ref<Sample_Types>& x)
    {
        return cell_at<Property<Array<T>>>(x.ptr(), array()->offset);
    }
};

using All_Types = testing::Types<boolean, uint8, sint8, uint16, sint16, uint32, sint32, uint64, sint64,
                                 real32, real64, char16, String, Datetime>;
TYPED_TEST_SUITE(Value_Typed_Test, All_Types);

} // namespace

TYPED_TEST(Value_Typed_Test, HoldsAScalar)
{
    Value x;
    x.clear();
    x.set_value(sample_value<TypeParam>(1));
    EXPECT_EQ(TYPE_OF<TypeParam>, x.type);
    EXPECT_FALSE(x.null);
    const Value copy(x);
    Value other;
    other.set_value(String("old"));
    other = copy;
    for (const Value* each : {static_cast<const Value*>(&x), &copy, static_cast<const Value*>(&other)}) {
        TypeParam out = sample_value<TypeParam>(0);
        EXPECT_EQ(0, each->get_value(out));
        EXPECT_TRUE(out == sample_value<TypeParam>(1));
    }
}

TYPED_TEST(Value_Typed_Test, HoldsAnArrayOfItsOwn)
{
    Array<TypeParam> array = sample_array<TypeParam>(0);
    Value x;
    x.set_value(array);
    EXPECT_EQ(ARRAY_TYPE_OF<TypeParam>, x.type);
    array.clear();
    const Value copy(x);
    x.clear();
    Array<TypeParam> out;
    EXPECT_EQ(0, copy.get_value(out));
    EXPECT_TRUE(out == sample_array<TypeParam>(0));
    EXPECT_EQ(-1, x.get_value(out));
    EXPECT_EQ(2u, out.size());
}

TYPED_TEST(Value_Typed_Test, LoadsAndStoresCells)
{
    const Ref<Sample_Types> from = make_types(0);
    const Ref<Sample_Types> to(create<Sample_Types>(true));
    for (const Meta_Property* mp : {this->scalar(), this->array()}) {
        Value x;
        ASSERT_EQ(0, x.set(from.ptr(), mp));
        EXPECT_EQ(type_of(mp), x.type);
        EXPECT_FALSE(x.null);
        ASSERT_EQ(0, x.get(to.ptr(), mp));
        EXPECT_TRUE(
            property_eq(mp, &cell_at<char>(from.ptr(), mp->offset), &cell_at<char>(to.ptr(), mp->offset)));
    }
    EXPECT_NE(this->array_of(from).value.data(), this->array_of(to).value.data());
}

TYPED_TEST(Value_Typed_Test, CarriesTheNullState)
{
    const Ref<Sample_Types> from(create<Sample_Types>(true));
    const Ref<Sample_Types> to = make_types(1);
    for (const Meta_Property* mp : {this->scalar(), this->array()}) {
        Value x;
        ASSERT_EQ(0, x.set(from.ptr(), mp));
        EXPECT_TRUE(x.null);
        EXPECT_EQ(type_of(mp), x.type);
        ASSERT_EQ(0, x.get(to.ptr(), mp));
    }
    EXPECT_EQ(1, this->scalar_of(to).null);
    EXPECT_TRUE(this->scalar_of(to).value == TypeParam());
    EXPECT_EQ(1, this->array_of(to).null);
    EXPECT_EQ(0u, this->array_of(to).value.size());
}

TYPED_TEST(Value_Typed_Test, ATypedNullIsEmpty)
{
    Value x;
    x.set_null(TYPE_OF<TypeParam>);
    EXPECT_EQ(TYPE_OF<TypeParam>, x.type);
    EXPECT_TRUE(x.null);
    TypeParam out = sample_value<TypeParam>(1);
    EXPECT_EQ(0, x.get_value(out));
    EXPECT_TRUE(out == TypeParam());
    x.set_null(ARRAY_TYPE_OF<TypeParam>);
    EXPECT_EQ(ARRAY_TYPE_OF<TypeParam>, x.type);
    EXPECT_TRUE(x.null);
    Array<TypeParam> array = sample_array<TypeParam>(0);
    EXPECT_EQ(0, x.get_value(array));
    EXPECT_EQ(0u, array.size());
}

TYPED_TEST(Value_Typed_Test, StoresOnlyWhereTheTypeIsTheSame)
{
    const Log_Capture log;
    Value scalar, array;
    scalar.set_value(sample_value<TypeParam>(1));
    array.set_value(sample_array<TypeParam>(1));
    const Ref<Sample_Types> x = make_types(0);
    Lines expected;
    for (const Meta_Feature* feature : features_of(x->__meta_class)) {
        const std::string line = std::string("WARN type mismatch: Sample_Types.") + feature->name;
        const bool fits_scalar = type_of(feature) == scalar.type;
        const bool fits_array = type_of(feature) == array.type;
        EXPECT_EQ(fits_scalar ? 0 : -1, scalar.get(x.ptr(), feature));
        EXPECT_EQ(fits_array ? 0 : -1, array.get(x.ptr(), feature));
        expected.insert(expected.end(), 2u - fits_scalar - fits_array, line);
    }
    EXPECT_EQ(expected, log.said());
}

TEST(Value, ANewOneIsNotNullAndAClearedOneIs)
{
    Value x;
    EXPECT_EQ(Value::NONE, x.type);
    EXPECT_FALSE(x.null);
    x.set_value(String());
    EXPECT_EQ(static_cast<Value::Type>(STRING), x.type);
    EXPECT_FALSE(x.null);
    x.clear();
    EXPECT_EQ(Value::NONE, x.type);
    EXPECT_TRUE(x.null);
    x.set_null(Value::NONE);
    EXPECT_EQ(Value::NONE, x.type);
    EXPECT_TRUE(x.null);
}

TEST(Value, NothingIsWidened)
{
    Value x;
    x.set_value(uint16(7));
    uint32 wide = 99;
    sint16 other = 98;
    Array<uint16> array;
    array.append(97);
    Instance* instance = nullptr;
    EXPECT_EQ(-1, x.get_value(wide));
    EXPECT_EQ(99u, wide);
    EXPECT_EQ(-1, x.get_value(other));
    EXPECT_EQ(98, other);
    EXPECT_EQ(-1, x.get_value(array));
    EXPECT_EQ(1u, array.size());
    EXPECT_EQ(-1, x.get_value(instance));
    char16 character = 1;
    EXPECT_EQ(-1, x.get_value(character));
}

TEST(Value, TextsMayComeFromTheValueItself)
{
    Value x;
    x.set_value("abc");
    String text;
    ASSERT_EQ(0, x.get_value(text));
    x.set_value(text.c_str() + 1);
    ASSERT_EQ(0, x.get_value(text));
    EXPECT_STREQ("bc", text.c_str());
    const Value& self = x;
    x = self;
    ASSERT_EQ(0, x.get_value(text));
    EXPECT_STREQ("bc", text.c_str());
}

TEST(Value, TakesOverAnInstanceAndCountsItsCopies)
{
    Sample_Element* element = make_element("x");
    ref(element);
    {
        Value x;
        x.set_value(element);
        EXPECT_EQ(Value::INSTANCE, x.type);
        EXPECT_EQ(2, element->__refs);
        const Value copy(x);
        EXPECT_EQ(3, element->__refs);
        Instance* out = nullptr;
        EXPECT_EQ(0, copy.get_value(out));
        EXPECT_EQ(element, out);
        EXPECT_EQ(3, element->__refs);
        x.clear();
        EXPECT_EQ(2, element->__refs);
        x = copy;
        x = copy;
        EXPECT_EQ(3, element->__refs);
    }
    EXPECT_EQ(1, element->__refs);
    unref(element);
}

TEST(Value, TakesOverTheElementsOfAnArrayOfInstances)
{
    Sample_Element* element = make_element("x");
    ref(element);
    {
        Array<Instance*> array;
        array.append(element);
        array.append(nullptr);
        Value x;
        x.set_value(array);
        EXPECT_EQ(Value::INSTANCE_ARRAY, x.type);
        EXPECT_EQ(2, element->__refs);
        const Value copy(x);
        EXPECT_EQ(3, element->__refs);
        Array<Instance*> out;
        EXPECT_EQ(0, copy.get_value(out));
        EXPECT_EQ(2u, out.size());
        EXPECT_EQ(element, out[0]);
        EXPECT_EQ(3, element->__refs);
    }
    EXPECT_EQ(1, element->__refs);
    unref(element);
}

TEST(Value, TypesOfFeatures)
{
    EXPECT_EQ(static_cast<Value::Type>(STRING), type_of(&_Sample_Group_Name));
    EXPECT_EQ(static_cast<Value::Type>(128 + UINT32), type_of(&_Sample_Element_Codes));
    EXPECT_EQ(Value::INSTANCE, type_of(LEADER));
    EXPECT_EQ(Value::INSTANCE_ARRAY, type_of(MEMBERS));
    EXPECT_EQ(Value::NONE, type_of(RESET));
    // An array of fixed size is one too.
    Meta_Property fixed = _Sample_Element_Codes;
    fixed.subscript = 4;
    EXPECT_EQ(static_cast<Value::Type>(128 + UINT32), type_of(&fixed));
    EXPECT_EQ(142, Value::INSTANCE_ARRAY);
    EXPECT_EQ(-1, Value::NONE);
}

TEST(Value, Names)
{
    const std::pair<const char*, const char*> rows[] = {
        {"BOOLEAN", "boolean"}, {"UINT8", "uint8"},       {"SINT8", "sint8"},       {"UINT16", "uint16"},
        {"SINT16", "sint16"},   {"UINT32", "uint32"},     {"SINT32", "sint32"},     {"UINT64", "uint64"},
        {"SINT64", "sint64"},   {"REAL32", "real32"},     {"REAL64", "real64"},     {"CHAR16", "char16"},
        {"STRING", "string"},   {"DATETIME", "datetime"}, {"INSTANCE", "instance"},
    };
    EXPECT_STREQ("NONE", _type_name(Value::NONE));
    EXPECT_STREQ("none", name_of(Value::NONE));
    for (int i = 0; i < 15; i++) {
        EXPECT_STREQ(rows[i].first, _type_name(Value::Type(i)));
        EXPECT_EQ(std::string(rows[i].first) + "_ARRAY", _type_name(Value::Type(128 + i)));
        EXPECT_STREQ(rows[i].second, name_of(Value::Type(i)));
        EXPECT_EQ(std::string(rows[i].second) + "_array", name_of(Value::Type(128 + i)));
    }
    EXPECT_STREQ("none", name_of(Value::Type(15)));
    EXPECT_STREQ("none", name_of(Value::Type(143)));
}

TEST(Value_set, CountsWhatItLoads)
{
    const Ref<Sample_Group> group = make_group("g");
    {
        Value x;
        ASSERT_EQ(0, x.set(group.ptr(), LEADER));
        EXPECT_FALSE(x.null);
        EXPECT_EQ(2, group->Leader->__refs);
        ASSERT_EQ(0, x.set(group.ptr(), MEMBERS));
        EXPECT_EQ(1, group->Leader->__refs);
        EXPECT_EQ(2, group->Members.value[0]->__refs);
    }
    EXPECT_EQ(1, group->Members.value[0]->__refs);
}

TEST(Value_set, NullReferences)
{
    const Ref<Sample_Group> group(create<Sample_Group>(true));
    Value x;
    ASSERT_EQ(0, x.set(group.ptr(), LEADER));
    EXPECT_TRUE(x.null);
    EXPECT_EQ(Value::INSTANCE, x.type);
    // The byte of an array decides, not whether it is empty.
    ASSERT_EQ(0, x.set(group.ptr(), MEMBERS));
    EXPECT_FALSE(x.null);
    group->Members.null = 1;
    ASSERT_EQ(0, x.set(group.ptr(), MEMBERS));
    EXPECT_TRUE(x.null);
}

TEST(Value_set, OfAMethodFailsAndClears)
{
    const Ref<Sample_Element> element(make_element("x"));
    Value x;
    x.set_value(uint8(1));
    EXPECT_EQ(-1, x.set(element.ptr(), RESET));
    EXPECT_EQ(Value::NONE, x.type);
    EXPECT_TRUE(x.null);
}

TEST(Value_get, NeedsAnInstance)
{
    const Log_Capture log;
    Value x;
    x.set_value("text");
    EXPECT_EQ(-1, x.get(nullptr, &_Sample_Group_Name));
    EXPECT_EQ((Lines{"WARN null instance argument"}), log.said());
    EXPECT_EQ("Value.cpp", log.lines().at(0).file);
}

TEST(Value_give, HandsATextOverAndIsGetForAllElse)
{
    const Log_Capture log;
    const Ref<Sample_Element> element(make_element("x"));
    Value x;
    x.set_value("handed over");
    const char* const text = x.peek<String>()->c_str();
    EXPECT_EQ(0, x.give(element.ptr(), &_Sample_Element_Name));
    EXPECT_EQ(text, element->Name.value.c_str());
    EXPECT_FALSE(element->Name.null);
    x.set_null(Value::Type(STRING));
    EXPECT_EQ(0, x.give(element.ptr(), &_Sample_Element_Name));
    EXPECT_TRUE(element->Name.null);
    EXPECT_EQ(-1, x.give(nullptr, &_Sample_Element_Name));
    EXPECT_EQ(-1, x.give(element.ptr(), RESET));
    x.set_value(uint8(1));
    EXPECT_EQ(-1, x.give(element.ptr(), &_Sample_Element_Name));
    EXPECT_EQ((Lines{"WARN null instance argument", "WARN type mismatch: Sample_Element.Reset",
                     "WARN type mismatch: Sample_Element.Name"}),
              log.said());
}

TEST(Value_get, OfAMethodFails)
{
    const Log_Capture log;
    const Ref<Sample_Element> element(make_element("x"));
    Value x;
    EXPECT_EQ(-1, x.get(element.ptr(), RESET));
    EXPECT_EQ(Lines{}, log.said());
    x.set_value(uint8(1));
    EXPECT_EQ(-1, x.get(element.ptr(), RESET));
    EXPECT_EQ((Lines{"WARN type mismatch: Sample_Element.Reset"}), log.said());
}

TEST(Value_get, SaysNothingWhenConversionLinesAreOff)
{
    const Log_Capture log;
    ASSERT_EQ(0, log_enable(false));
    Value x;
    EXPECT_EQ(-1, x.get(nullptr, &_Sample_Group_Name));
    ASSERT_EQ(0, log_enable(true));
    EXPECT_EQ(Lines{}, log.said());
}

TEST(Value_get, TakesInstancesOfTheTargetClassAndItsSubclasses)
{
    const Log_Capture log;
    const Ref<Sample_Link> link(create<Sample_Link>(true));
    Value port;
    port.set_value(make_port("p", 1));
    Value element;
    element.set_value(make_element("e"));
    EXPECT_EQ(0, port.get(link.ptr(), &_Sample_Link_Antecedent));
    EXPECT_EQ(2, link->Antecedent->__refs);
    EXPECT_EQ(-1, element.get(link.ptr(), &_Sample_Link_Dependent));
    EXPECT_EQ(nullptr, link->Dependent);
    EXPECT_EQ((Lines{"WARN failed to assign instance of Sample_Element to Sample_Link.Dependent"}),
              log.said());
}

TEST(Value_get, StoresANullReference)
{
    const Ref<Sample_Link> link(create<Sample_Link>(true));
    Value x;
    x.set_null(Value::INSTANCE);
    EXPECT_EQ(0, x.get(link.ptr(), &_Sample_Link_Antecedent));
    EXPECT_EQ(nullptr, link->Antecedent);
}

// The cell is taken for a nulled one: whoever held an instance there keeps its count.
TEST(Value_get, DoesNotReleaseWhatTheCellHeld)
{
    const Ref<Sample_Group> group = make_group("g");
    Instance* old = group->Leader;
    Value x;
    x.set_value(make_element("new"));
    EXPECT_EQ(0, x.get(group.ptr(), LEADER));
    EXPECT_NE(old, group->Leader);
    EXPECT_EQ(1, old->__refs);
    unref(old);
}

TEST(Value_get, StoresAnArrayOfInstances)
{
    const Ref<Sample_Group> group(create<Sample_Group>(true));
    // Its null byte is not written.
    group->Members.null = 1;
    Array<Instance*> array;
    array.append(make_port("p", 1));
    array.append(nullptr);
    Value x;
    x.set_value(array);
    EXPECT_EQ(0, x.get(group.ptr(), MEMBERS));
    ASSERT_EQ(2u, group->Members.value.size());
    EXPECT_EQ(2, group->Members.value[0]->__refs);
    EXPECT_EQ(nullptr, group->Members.value[1]);
    EXPECT_EQ(1, group->Members.null);
}

TEST(Value_get, AnElementThatDoesNotFitLeavesTheArrayAssignedAndCounted)
{
    const Log_Capture log;
    const Ref<Sample_Group> group(create<Sample_Group>(true));
    {
        Array<Instance*> array;
        array.append(make_port("p", 1));
        array.append(make_element("e"));
        array.append(make_port("q", 2));
        Value x;
        x.set_value(array);
        EXPECT_EQ(-1, x.get(group.ptr(), MEMBERS));
        EXPECT_EQ((Lines{"WARN failed to assign instance of Sample_Element to Sample_Group.Members"}),
                  log.said());
        ASSERT_EQ(3u, group->Members.value.size());
        EXPECT_EQ(2, group->Members.value[0]->__refs);
    }
    // They outlive the value: the instance releases each of them.
    for (Instance* member : group->Members.value)
        EXPECT_EQ(1, member->__refs);
}

TEST(Lent_Value_Test, ShowsTheCellWithoutHoldingIt)
{
    const Ref<Sample_Group> group = make_group("g");
    {
        Lent_Value leader;
        leader.show(group.ptr(), cell_of(LEADER));
        Instance* target = nullptr;
        EXPECT_EQ(0, (*leader).get_value(target));
        EXPECT_EQ(group->Leader, target);
        EXPECT_EQ(1, target->__refs);

        Lent_Value members;
        members.show(group.ptr(), cell_of(MEMBERS));
        ASSERT_NE(nullptr, (*members).peek<Array<Instance*>>());
        EXPECT_EQ(group->Members.value.data(), (*members).peek<Array<Instance*>>()->data());
        // A copy of it is a value like any other.
        const Value copy(*members);
        EXPECT_EQ(2, group->Members.value[0]->__refs);
    }
    EXPECT_EQ(1, group->Leader->__refs);
    EXPECT_EQ(1, group->Members.value[0]->__refs);
}

TEST(Value_Test, PeekKnowsItsType)
{
    Value x;
    x.set_value("text");
    ASSERT_NE(nullptr, x.peek<String>());
    EXPECT_STREQ("text", x.peek<String>()->c_str());
    EXPECT_EQ(nullptr, x.peek<uint8>());
}

} // namespace KPRV
