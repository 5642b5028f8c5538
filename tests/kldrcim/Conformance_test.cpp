// The walk of a profile's client over a module that knows nothing of profiles.
#include "tests/broker/Toy_Server.h"
#include "tests/kldrcim/Run_Kldrcim.h"

#include "kldrcim/local/Local_Connection.h"
#include "kldrcim/walks/Conformance.h"

namespace KPRV::kldrcim {
namespace {

using Verdict = Conformance_Finding::Verdict;

TEST(Conformance, AModuleWithoutProfilesMissesTheThreeAndReachesNothing)
{
    Local_Connection connection(open_toy(TOY_DESCRIBED));
    std::vector<Conformance_Finding> findings = check_conformance(connection);
    EXPECT_TRUE(misses_something(findings));
    for (const Conformance_Finding& finding : findings) {
        SCOPED_TRACE(finding.step->name);
        EXPECT_EQ(0u, finding.found);
        if (finding.step->from) {
            EXPECT_EQ(Verdict::NO_START, finding.verdict);
            EXPECT_EQ(0u, finding.missing.size());
        } else {
            EXPECT_EQ(Verdict::MISSING, finding.verdict);
            EXPECT_EQ((std::vector<std::string>{"CIM_ERR_INVALID_CLASS", "none"}), finding.missing);
        }
    }
}

TEST(Conformance, ThePlanStartsEachStepAtAnEarlierOne)
{
    std::vector<std::string> names;
    for (const Conformance_Step* step = conformance_steps; step->name; ++step) {
        SCOPED_TRACE(step->name);
        if (step->from) {
            EXPECT_NE(names.end(), std::find(names.begin(), names.end(), step->from));
        }
        EXPECT_EQ(names.end(), std::find(names.begin(), names.end(), step->name));
        EXPECT_LE(step->least, step->most);
        names.push_back(step->name);
    }
    EXPECT_NE(nullptr, conformance_steps[0].section);
}

TEST(Conformance, TheProgramSaysSoAndFails)
{
    Outcome run = kldrcim("conform", TOY_DESCRIBED);
    EXPECT_EQ(1, run.status);
    EXPECT_NE(std::string::npos, run.out.find("missing: CIM_ERR_INVALID_CLASS, none\n")) << run.out;
    EXPECT_NE(std::string::npos, run.out.find("\nelements with something missing: 3\n")) << run.out;
    EXPECT_EQ(2, kldrcim("conform now", TOY_DESCRIBED).status);
}

} // namespace
} // namespace KPRV::kldrcim
