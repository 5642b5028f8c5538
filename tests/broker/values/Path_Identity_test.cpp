#include "broker/values/Path_Identity.h"

#include "broker/values/Path_Digest.h"

#include "tests/broker/Toy_Server.h"

namespace KPRV::broker {
namespace {

/// The identity, its digest and `same_object` must always agree.
void expect_same(bool same, const Path_Value& a, const Path_Value& b)
{
    EXPECT_EQ(same, same_object(a, b));
    EXPECT_EQ(same, path_identity(a) == path_identity(b)) << path_identity(a) << "\n" << path_identity(b);
    EXPECT_EQ(same, path_digest(a) == path_digest(b)) << path_identity(a) << "\n" << path_identity(b);
}

Path_Value keyed(Plain_Value value)
{
    return {.class_name = "C", .keys = {{"K", std::move(value)}}};
}

TEST(Path_Identity, AgreesWithTheComparisonOfObjects)
{
    Path_Value one = {.name_space = "x",
                      .class_name = "C",
                      .keys = {{"A", Plain_Value::text("a")}, {"B", Plain_Value::text("b")}}};
    expect_same(true, one,
                {.class_name = "c", .keys = {{"b", Plain_Value::text("b")}, {"a", Plain_Value::text("a")}}});
    expect_same(false, one,
                {.class_name = "C", .keys = {{"A", Plain_Value::text("a")}, {"B", Plain_Value::text("B")}}});
    expect_same(false, one, {.class_name = "C", .keys = {{"A", Plain_Value::text("a")}}});
    expect_same(true, keyed(Plain_Value::unsigned_number(CMPI_uint64, 7)),
                keyed(Plain_Value::signed_number(CMPI_sint16, 7)));
    expect_same(false, keyed(Plain_Value::unsigned_number(CMPI_uint8, 1)), keyed(Plain_Value::text("1")));
    expect_same(false, keyed(Plain_Value::boolean(true)), keyed(Plain_Value::text("true")));
    expect_same(true, keyed(Plain_Value::path(keyed(Plain_Value::unsigned_number(CMPI_uint8, 1)))),
                keyed(Plain_Value::path(keyed(Plain_Value::signed_number(CMPI_sint64, 1)))));
    // A text cannot pretend to be two keys.
    expect_same(false, keyed(Plain_Value::text("a\",b=5\"b")),
                {.class_name = "C", .keys = {{"K", Plain_Value::text("a")}, {"b", Plain_Value::text("b")}}});
}

} // namespace
} // namespace KPRV::broker
