// Bad answers of the adapter library while the module is loaded or unloaded, and while indications are
// enabled or disabled. Each in a process of its own, which some of them end.
#include "tests/faults/Ends_Process.h"
#include "tests/faults/Sweep_Fixture.h"
#include "tests/support/In_Child.h"

#include <algorithm>
#include <dlfcn.h>

namespace KPRV::start_answers {
namespace {

enum Thrown
{
    GUARDED,
    PASSES,
};

struct Load_Way
{
    const char* entry_point;
    Answer_Kind answers;
    Thrown thrown;
};

constexpr Load_Way load_ways[] = {
#define LOADED(entry_point, answers, thrown) {#entry_point, answers, thrown},
#include "tests/faults/Ways_In.def"
};

class Load_Answers : public Sweep_Fixture, public testing::TestWithParam<Load_Way>
{
protected:
    Picture look()
    {
        Picture picture;
        for (const char* name :
             {"KALDERA_ComputerSystem", "KALDERA_PortController", "KALDERA_FCPort", "KALDERA_EthernetPort"}) {
            const broker::Result result = server->enumerate_instances(name);
            EXPECT_EQ(CMPI_RC_OK, result.rc) << name;
            picture[name] = lasting_texts(result);
            EXPECT_FALSE(picture[name].empty()) << name;
        }
        return picture;
    }
    /// Loads, looks and unloads with the fault standing all the time.
    Picture live_through(const Bad_Answer& bad)
    {
        restore();
        simulator.add_fault(bad.fault(GetParam().entry_point));
        std::string error;
        server = broker::Local_Server::open(module_under_test(), {}, error);
        EXPECT_TRUE(server) << error;
        Picture picture = elsewhere([&] { return look(); });
        server->unload(true);
        expect_nothing_left();
        server.reset();
        EXPECT_EQ(nullptr, dlopen(module_under_test(), RTLD_NOW | RTLD_NOLOAD)) << "it is unloaded";
        return picture;
    }
};

TEST_P(Load_Answers, AreNoMatterOfTheInstances)
{
    in_child([&] {
        open_host();
        EXPECT_TRUE(was_called(GetParam().entry_point) ||
                    GetParam().entry_point == std::string("free_hba_lib"));
        const Picture healthy = look();
        close_host();
        for (const Bad_Answer& bad : bad_answers_of(GetParam().answers)) {
            if (bad.thrown && GetParam().thrown == PASSES)
                continue;
            SCOPED_TRACE(bad.name);
            EXPECT_EQ(healthy, live_through(bad));
        }
        open_host();
        EXPECT_EQ(healthy, look());
        close_host();
    });
}

class Unguarded_Load : public Load_Answers
{
public:
    static std::vector<Load_Way> own_ways()
    {
        std::vector<Load_Way> own;
        std::copy_if(std::begin(load_ways), std::end(load_ways), std::back_inserter(own),
                     [](const Load_Way& way) { return way.thrown == PASSES; });
        return own;
    }
};

TEST_P(Unguarded_Load, EndsTheProcessIfTheLibraryThrows)
{
    for (const Bad_Answer& bad : bad_answers_of(NONE)) {
        SCOPED_TRACE(bad.name);
        expect_end_of_process([&] {
            restore();
            simulator.add_fault(bad.fault(GetParam().entry_point));
            std::string error;
            broker::Local_Server::open(module_under_test(), {}, error);
        });
    }
}

std::string name_of(const testing::TestParamInfo<Load_Way>& row)
{
    return row.param.entry_point;
}

INSTANTIATE_TEST_SUITE_P(Way, Load_Answers, testing::ValuesIn(load_ways), name_of);
INSTANTIATE_TEST_SUITE_P(Way, Unguarded_Load, testing::ValuesIn(Unguarded_Load::own_ways()), name_of);

} // namespace
} // namespace KPRV::start_answers
