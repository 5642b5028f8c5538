#include "broker/values/Path_Identity.h"

#include "tests/broker/Toy_Host.h"

namespace KPRV::broker {
namespace {

/// The identity and `same_object` must always agree.
void expect_same(bool same, const Path_Value& a, const Path_Value& b)
{
    EXPECT_EQ(same, same_object(a, b));
    EXPECT_EQ(same, path_identity(a) == path_identity(b)) << path_identity(a) << "\n" << path_identity(b);
}

Path_Value keyed(Value value)
{
    return {.class_name = "C", .keys = {{"K", std::move(value)}}};
}

TEST(Path_Identity, AgreesWithTheComparisonOfObjects)
{
    Path_Value one = {
        .name_space = "x", .class_name = "C", .keys = {{"A", Value::text("a")}, {"B", Value::text("b")}}};
    expect_same(true, one, {.class_name = "c", .keys = {{"b", Value::text("b")}, {"a", Value::text("a")}}});
    expect_same(false, one, {.class_name = "C", .keys = {{"A", Value::text("a")}, {"B", Value::text("B")}}});
    expect_same(false, one, {.class_name = "C", .keys = {{"A", Value::text("a")}}});
    expect_same(true, keyed(Value::unsigned_number(CMPI_uint64, 7)),
                keyed(Value::signed_number(CMPI_sint16, 7)));
    expect_same(false, keyed(Value::unsigned_number(CMPI_uint8, 1)), keyed(Value::text("1")));
    expect_same(false, keyed(Value::boolean(true)), keyed(Value::text("true")));
    expect_same(true, keyed(Value::path(keyed(Value::unsigned_number(CMPI_uint8, 1)))),
                keyed(Value::path(keyed(Value::signed_number(CMPI_sint64, 1)))));
    // A text cannot pretend to be two keys.
    expect_same(false, keyed(Value::text("a\",b=5\"b")),
                {.class_name = "C", .keys = {{"K", Value::text("a")}, {"b", Value::text("b")}}});
}

} // namespace
} // namespace KPRV::broker
