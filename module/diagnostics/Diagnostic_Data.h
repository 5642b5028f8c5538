#pragma once

#include "module/adapter/ProviderUtil.h"
#include "module/diagnostics/Tested_Element.h"
#include "module/runtime/ground/Datetime.h"

namespace KPRV {

class DiagnosticHelper;

/// `CompletionState` of a completion record.
enum diag_compl_record_state_t : uint16
{
    COMPLETION_PASSED = 2,
    COMPLETION_FAILED = 5,
};

/// `JobState` of a run: over says nothing of the outcome.
inline constexpr uint16 JOB_RUNNING = 4;
inline constexpr uint16 JOB_OVER = 7;

/// Input of one run, made by its start and used by its thread.
struct DiagnosticTestInput : Tested_Element
{
    diag_test_id_t test_id{0};
    /// `InstanceID` of the run's job.
    String job_id;
    /// Of the memory test.
    int adapter_id = 0;
    uint32 frame_count = 0;
    uint32 data_pattern = 0;
    /// See `Diagnostic_Test`. Either way (constant): the start of a test sets it.
    uint32 mode = 0;
    /// Link speed in Gbit/s, 4 or 10, of the loopback test.
    uint32 speed = 0;
    DiagnosticHelper* helper = nullptr;
    /// The run before: see `keep_for_ever` in Test_Start.cpp.
    DiagnosticTestInput* previous = nullptr;
};

/// One run, as clients follow it.
struct DiagnosticJob : Tested_Element
{
    /// Test name, "-", job number.
    String instance_id;
    uint16 job_state = JOB_RUNNING;
    Datetime start_time;
    /// The zero interval for ever.
    Datetime elapsed_time;
    uint16 percent_complete = 0;
};

/// One message of a run.
struct DiagnosticRecord : Tested_Element
{
    /// Progress rather than result: it becomes a service record rather than a completion record.
    bool is_service = false;
    /// Job id, ":", record number.
    String instance_id;
    Datetime creation_time;
    String record_data;
    /// Name of the test.
    String service_name;
    /// 4 of a service record, 6 of a completion record. Either way (constant): whoever makes one says which.
    uint16 record_type = 0;
    /// Of a completion record.
    diag_compl_record_state_t completion_state = COMPLETION_PASSED;
};

} // namespace KPRV
