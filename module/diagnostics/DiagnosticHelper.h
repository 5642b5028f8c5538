#pragma once

#include "module/diagnostics/Diagnostic_Data.h"
#include "module/diagnostics/Diagnostic_Tests.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/system/Mutex.h"
#include "module/schema/KALDERA_ConcreteJob.h"
#include "module/schema/KALDERA_DiagnosticSoftwareIdentity.h"
#include "module/schema/KALDERA_EthLoopbackDiagnosticTest.h"
#include "module/schema/KALDERA_LoopbackDiagnosticTest.h"
#include "module/schema/KALDERA_MemoryDiagnosticTest.h"
#include "module/schema/KALDERA_PCILoopbackDiagnosticTest.h"

#include <atomic>
#include <initializer_list>
#include <memory>
#include <vector>

namespace KPRV {

class Fresh_Instances;

/// `return_value` of `RunDiagnostic`.
enum Run_Code : uint32
{
    RUN_NOT_SUPPORTED = 1,
    RUN_FAILED = 4,
    RUN_INVALID_PARAMETER = 5,
    RUN_JOB_STARTED = 4096,
};

/// What became of a start.
struct Run_Result
{
    Run_Code code;
    /// The new job with its key alone, which the caller owns; null if there is none.
    KALDERA_ConcreteJob* job = nullptr;
};

/// Runs hardware tests, at most one at a time in the host, and keeps what there is to say of them in memory:
/// the present or last job, and the last 100 service and 100 completion records. Instances belong to the
/// caller. Any thread may call; each list has a lock, and a read holds it to its end, so that a list does not
/// change while its records look their elements up.
class DiagnosticHelper
{
public:
    DiagnosticHelper();
    DiagnosticHelper(const DiagnosticHelper&) = delete;
    DiagnosticHelper& operator=(const DiagnosticHelper&) = delete;

    /// The one of the module. Never destroyed, since a test thread may outlive the module's unloading.
    static DiagnosticHelper* getDiagnosticHelperObject();

    /// Serves ids 21 to 28 and 31 to 33; empty without adapters, also the records of earlier runs. Exceptions
    /// of `libGetAllAdaptersIndexString` pass.
    Array<Instance*> getInstancesByClass(classId_t id);
    /// All test instances, with or without adapters.
    Array<Instance*> getDiagnosticServices() const;

    // Test instances, by test id and class id.
    KALDERA_MemoryDiagnosticTest* getMemoryDiagnosticTestInstance(diag_test_id_t test, classId_t id) const;
    KALDERA_LoopbackDiagnosticTest* getLoopbackDiagnosticTestInstance(diag_test_id_t test,
                                                                      classId_t id) const;
    KALDERA_PCILoopbackDiagnosticTest* getPCILoopbackDiagnosticTestInstance(diag_test_id_t test,
                                                                            classId_t id) const;
    KALDERA_EthLoopbackDiagnosticTest* getEthLoopbackDiagnosticTestInstance(diag_test_id_t test,
                                                                            classId_t id) const;
    KALDERA_DiagnosticSoftwareIdentity* getDiagnosticSoftwareIdentityInstance() const;

    KALDERA_ConcreteJob* getConcreteJobInstance(const DiagnosticJob& job) const;
    Instance* getDiagnosticRecordInstance(const DiagnosticRecord& record) const;
    /// The element under test; null if it has gone.
    Instance* getManagedElementInstance(const DiagnosticRecord& record) const;
    /// Its `ElementName`, or the empty text.
    String getManagedElementName(const DiagnosticRecord& record) const;

    // Lists, oldest first.
    Array<Instance*> getDiagnosticJobInstances();
    Array<Instance*> getDiagnosticServiceRecordInstances();
    Array<Instance*> getDiagnosticCompletionRecordInstances();
    /// Pairs of job and element; without an element both references are null.
    Array<Instance*> getDiagnosticAffectedJobElementInstances();
    /// Pairs of record and element; the element is null if it has gone.
    Array<Instance*> getServiceRecordAppliesToElementInstances();
    Array<Instance*> getCompletionRecordAppliesToElementInstances();

    // Starts. The address is a `DeviceID`: 12 characters of a MAC or 16 of a WWN. A refusal leaves the job
    // list as it was; a start answers at once, and a thread does the rest.
    Run_Result runLoopbackTest(const String& portId, const String& testName);
    Run_Result runEthLoopbackTest(const String& portId, const String& testName);
    Run_Result runPCILoopbackTest(const String& portId);
    /// Exceptions of `libGetAdapterId` pass.
    Run_Result runMemoryTest(const String& address);

    // The threads' functions; the argument is the run's `DiagnosticTestInput`, the result 0.
    static void* runLoopbackTestThread(void* input);
    static void* runEthLoopbackTestThread(void* input);
    static void* runPCILoopbackTestThread(void* input);
    static void* runMemoryTestThread(void* input);

    // What a run leaves behind.

    /// A new job of the input. It is in no list yet.
    DiagnosticJob createDiagnosticJob(const DiagnosticTestInput* input);
    /// Puts a job in the place of the one before, whatever the state of that.
    void addDiagnosticJob(const DiagnosticJob& job);
    bool isAnyJobRunning();
    /// Ends the job of that id, if it is still there.
    void updateJobState(const String& job_id);
    void generateDiagnosticRecord(const String& text, bool is_service, const DiagnosticTestInput* input,
                                  diag_compl_record_state_t state);
    /// The 101st of a kind pushes out the oldest.
    void addDiagnosticRecord(const DiagnosticRecord& record);

    /// One counter for both kinds of records.
    uint32 getNextRecordID() { return ++_record_number; }
    uint32 getNextJobID() { return ++_job_number; }

private:
    template <class T>
    struct List
    {
        Mutex lock;
        std::vector<T> entries GUARDED_BY(lock);
    };

    Instance* test_instance(diag_test_id_t id) const;
    void append_tests(std::initializer_list<diag_test_id_t> ids, Fresh_Instances& tests) const;
    Array<Instance*> tests_of_class(classId_t id) const;
    template <class T, class Make>
    Array<Instance*> read(List<T>& list, Make make);

    Run_Result start_loopback(const String& portId, const String& testName);
    Run_Result start(const Diagnostic_Test& test, std::unique_ptr<DiagnosticTestInput> input);

    std::atomic<uint32> _record_number = 0;
    std::atomic<uint32> _job_number = 0;
    List<DiagnosticRecord> _service_records;
    List<DiagnosticRecord> _completion_records;
    List<DiagnosticJob> _jobs;
};

} // namespace KPRV
