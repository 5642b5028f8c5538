#pragma once

#include "broker/Host.h"

#include <functional>

namespace KPRV::kldrcim {

using namespace broker;

/// One record of a run.
struct Run_Record
{
    /// Of the run's module: it counts the records of all runs.
    unsigned long number = 0;
    /// Of day, in UTC.
    std::string time;
    /// "passed" or "failed" of a result; empty for progress.
    std::string outcome;
    std::string text;
};

struct Run_Report
{
    /// In the order in which the run wrote them.
    std::vector<Run_Record> records;
    /// There are results, and all of them passed.
    bool passed = false;
};

/// True until the end of a run: of its thread, not only of its job, which is closed before the results are
/// written.
bool is_test_running(Host& host);

/// Follows a run to its end and collects its records. Meanwhile standard error shows the job's state and how
/// long it has been at work: on a terminal in one line that changes, else a line for each state. `pause` is
/// called between two looks.
Run_Report follow_job(Host& host, const Path_Value& job, const std::function<void()>& pause);

} // namespace KPRV::kldrcim
