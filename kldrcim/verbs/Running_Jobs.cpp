#include "kldrcim/verbs/Running_Jobs.h"

#include "broker/values/Value_Text.h"

namespace KPRV::kldrcim {

namespace {

constexpr std::uint64_t job_over = 7;

} // namespace

std::string running_jobs(Connection& connection)
{
    std::string jobs;
    for (const Instance_Value& job : connection.enumerate_instances("KALDERA_ConcreteJob").instances) {
        const Value* const state = job.property("JobState");
        if (!state || state->null || state->as_uint() != job_over)
            jobs += (jobs.empty() ? "" : ", ") + path_text(job.path);
    }
    return jobs;
}

} // namespace KPRV::kldrcim
