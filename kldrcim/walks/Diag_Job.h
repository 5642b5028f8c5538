#pragma once

#include "kldrcim/connection/Connection.h"

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

/// Follows a run to its end and collects its records. Meanwhile standard error shows the job's state and how
/// long it has been at work: on a terminal in one line that changes, else a line for each state. `pause` is
/// called between two looks; false is enough, and the report has what there is.
Run_Report follow_job(Connection& connection, const Path_Value& job, const std::function<bool()>& pause);

} // namespace KPRV::kldrcim
