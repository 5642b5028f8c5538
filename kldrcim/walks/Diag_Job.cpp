#include "kldrcim/walks/Diag_Job.h"

#include "broker/values/Datetime_Text.h"

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

using Clock = std::chrono::steady_clock;
constexpr std::uint64_t JOB_OVER = 7;
constexpr std::uint64_t PASSED = 2;
constexpr const char* running = "running";
constexpr int MOST_LOOKS = 50;

std::string state_words(const Result& job)
{
    const Plain_Value* const state =
        job.ok() && !job.instances.empty() ? job.instances[0].property("JobState") : nullptr;
    if (!state)
        return "unknown";
    return state->as_uint() == JOB_OVER ? "completed" : running;
}

/// Shows how a job gets on.
class Progress
{
public:
    void show(const std::string& state)
    {
        const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(Clock::now() - _begin).count();
        if (_terminal)
            std::fprintf(stderr, "\r%s, %lld s ", state.c_str(), static_cast<long long>(seconds));
        else if (state != _shown)
            std::fprintf(stderr, "%s, %lld s\n", state.c_str(), static_cast<long long>(seconds));
        _shown = state;
    }
    ~Progress()
    {
        if (_terminal)
            std::fputs("\n", stderr);
    }

private:
    const Clock::time_point _begin = Clock::now();
    const bool _terminal = isatty(STDERR_FILENO);
    std::string _shown;
};

/// The clock's part of a timestamp that is given in UTC.
std::string time_of_day(const std::string& datetime)
{
    const std::string utc = is_datetime_text(datetime) ? datetime_text(datetime_microseconds(datetime), false)
                                                       : std::string(25, '0');
    return utc.substr(8, 2) + ":" + utc.substr(10, 2) + ":" + utc.substr(12, 2) + utc.substr(14, 4);
}

void collect(Connection& connection, const char* class_name, const std::string& job_id, Run_Report& report)
{
    const std::string head = job_id + ":";
    for (const Instance_Value& each : connection.enumerate_instances(class_name).instances) {
        const auto text_of = [&](const char* name) {
            const Plain_Value* const value = each.property(name);
            return value ? value->as_text() : std::string();
        };
        const std::string id = text_of("InstanceID");
        if (!id.starts_with(head))
            continue;
        const Plain_Value* const state = each.property("CompletionState");
        const bool passed = state && state->as_uint() == PASSED;
        report.records.push_back({std::strtoul(id.c_str() + head.size(), nullptr, 10),
                                  time_of_day(text_of("CreationTimeStamp")),
                                  !state   ? ""
                                  : passed ? "passed"
                                           : "failed",
                                  text_of("RecordData")});
    }
}

Run_Report records_of(Connection& connection, const Path_Value& job)
{
    Run_Report report;
    const Plain_Value* const id = job.key("InstanceID");
    for (const char* class_name : {"KALDERA_DiagnosticServiceRecord", "KALDERA_DiagnosticCompletionRecord"})
        collect(connection, class_name, id ? id->as_text() : "", report);
    std::ranges::sort(report.records, {}, &Run_Record::number);
    const auto count = [&](const char* outcome) {
        return std::ranges::count(report.records, outcome, &Run_Record::outcome);
    };
    report.passed = count("failed") == 0 && count("passed") > 0;
    return report;
}

bool has_result(const Run_Report& report)
{
    return std::ranges::any_of(report.records, [](const Run_Record& each) { return !each.outcome.empty(); });
}

/// True until the end of a run: in this process of its thread, not only of its job.
bool is_running(Connection& connection, const Path_Value& job)
{
    return connection.is_in_process() ? connection.is_at_work()
                                      : state_words(connection.get_instance(job)) == running;
}

} // namespace

Run_Report follow_job(Connection& connection, const Path_Value& job, const std::function<bool()>& pause)
{
    bool goes_on = true;
    {
        Progress progress;
        while (goes_on && is_running(connection, job)) {
            progress.show(state_words(connection.get_instance(job)));
            goes_on = pause();
        }
        progress.show(state_words(connection.get_instance(job)));
    }
    Run_Report report = records_of(connection, job);
    // A job is closed before its results are written; in this process its thread has been waited for.
    for (int looks = 0; !connection.is_in_process() && looks < MOST_LOOKS && goes_on && !has_result(report);
         ++looks) {
        goes_on = pause();
        report = records_of(connection, job);
    }
    return report;
}

} // namespace KPRV::kldrcim
