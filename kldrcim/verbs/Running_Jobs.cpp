#include "kldrcim/verbs/Running_Jobs.h"

#include "broker/values/Value_Text.h"

namespace KPRV::kldrcim {

namespace {

constexpr std::uint64_t JOB_OVER = 7;

} // namespace

std::string running_jobs(Connection& connection)
{
    std::string jobs;
    for (const Instance_Value& job : connection.enumerate_instances("KALDERA_ConcreteJob").instances) {
        const Plain_Value* const state = job.property("JobState");
        if (!state || state->null || state->as_uint() != JOB_OVER)
            jobs += (jobs.empty() ? "" : ", ") + path_text(job.path);
    }
    return jobs;
}

} // namespace KPRV::kldrcim
