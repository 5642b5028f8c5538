#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/module/exports/Traces.h"
#include "tests/support/Module_Picture.h"

#include <algorithm>

namespace KPRV {
namespace {

using Traces = Module_Fixture;

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
        text += name + "\n" + as_text(traces_of(log_lines()));
    }
    expect_golden("traces", text, ".txt");
}

} // namespace
} // namespace KPRV
