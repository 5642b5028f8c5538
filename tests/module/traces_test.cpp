#include "tests/module/Golden.h"
#include "tests/module/Module_Fixture.h"
#include "tests/support/Module_Picture.h"

#include <algorithm>

namespace KPRV {
namespace {

using Traces = Module_Fixture;

/// What a walk enters (>) and leaves (<), each where it comes first. How often it comes is a matter of the
/// host.
std::string traces_of(const std::vector<Log_Line>& lines)
{
    const std::string entering = "Entering: ", returning = "Returning: ";
    Lines seen;
    for (const Log_Line& line : lines) {
        if (!line.is_trace())
            continue;
        EXPECT_EQ("DBG", line.level);
        const bool enters = line.text.starts_with(entering);
        const std::string name = line.text.substr((enters ? entering : returning).size());
        const std::string trace = (enters ? "  > " : "  < ") + line.file + " " + name + "\n";
        if (std::ranges::find(seen, trace) == seen.end())
            seen.push_back(trace);
    }
    std::string text;
    for (const std::string& trace : seen)
        text += trace;
    return text;
}

// Of each class over a host that has every kind of thing: support reads a log by them.
TEST_F(Traces, OfEveryEnumeration)
{
    open("rich.json");
    std::string text;
    std::vector<std::string> names = enumerable_classes(*server);
    std::ranges::sort(names);
    for (const std::string& name : names) {
        mark();
        server->enumerate_instances(name);
        text += name + "\n" + traces_of(log_lines());
    }
    expect_golden("traces", text, ".txt");
}

} // namespace
} // namespace KPRV
