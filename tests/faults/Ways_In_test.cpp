#include <gtest/gtest.h>

#include <set>
#include <string>

namespace KPRV::ways_in {
namespace {

// A new entry point has to be put into the table, and so into the sweep.
TEST(Ways_In, LeadToEveryEntryPoint)
{
    const std::set<std::string> entry_points = {
#define ENTRY_POINT(symbol, variable, signature) #symbol,
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    };
    const std::set<std::string> reached = {
#define AGENT(entry_point, ...) #entry_point,
#define LISTED AGENT
#define INVOKED AGENT
#define TESTED AGENT
#define LOADED AGENT
#define SUBSCRIBED AGENT
#define UNREACHED AGENT
#include "tests/faults/Ways_In.def"
    };
    EXPECT_EQ(117u, entry_points.size());
    EXPECT_EQ(entry_points, reached);
}

} // namespace
} // namespace KPRV::ways_in
