#include "module/diagnostics/DiagnosticHelper.h"

#include "module/adapter/Adapter_List.h"
#include "module/model/Fresh_Instances.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <algorithm>
#include <new>
#include <string>

namespace KPRV {

namespace {

constexpr size_t MOST_RECORDS = 100;

/// A host that has one offers no external loopback test and no Ethernet loopback test for any adapter.
bool has_special_model()
{
    return ProviderUtil::checkIfThisAdapterModelPresent("Kaldera-4410") == 1;
}

/// The job number is cut to 7 digits.
String job_id_of(const char* test_name, uint32 number)
{
    return String(test_name, "-", std::to_string(number).substr(0, 7).c_str());
}

/// Cut to 49 characters. A number above 2147483647 prints as a negative one.
String getInstanceIDForRecord(const String& job_id, uint32 number)
{
    const std::string id = job_id.c_str() + (":" + std::to_string(static_cast<int>(number)));
    return id.substr(0, 49).c_str();
}

} // namespace

DiagnosticHelper::DiagnosticHelper()
{
    LOG(DBG, "Inside DiagnosticHelper Constructor");
}

DiagnosticHelper* DiagnosticHelper::getDiagnosticHelperObject()
{
    alignas(DiagnosticHelper) static unsigned char storage[sizeof(DiagnosticHelper)];
    static DiagnosticHelper* const diagHelperObj = new (storage) DiagnosticHelper;
    return diagHelperObj;
}

Array<Instance*> DiagnosticHelper::getInstancesByClass(classId_t id)
{
    LOG_SCOPE("getInstancesByClass");
    LOG(INFO, "Requested Class : %s", ProviderUtil::getClassName(id));
    Json::Value response;
    const Json::Value* const adapters = query_adapter_list(LOG_HERE, response);
    if (!adapters)
        return {};
    if (adapters->empty()) {
        LOG(WARN, "No adapters in the system for running diagnostics.");
        return {};
    }
    switch (id) {
    case MEMORYDIAGNOSTICTEST:
    case LOOPBACKDIAGNOSTICTEST:
    case PCILOOPBACKDIAGNOSTICTEST:
    case ETHLOOPBACKDIAGNOSTICTEST:
        return tests_of_class(id);
    case DIAGNOSTICSOFTWAREIDENTITY:
        return only(getDiagnosticSoftwareIdentityInstance());
    case CONCRETEJOB:
        return getDiagnosticJobInstances();
    case DIAGNOSTICSERVICERECORD:
        return getDiagnosticServiceRecordInstances();
    case DIAGNOSTICCOMPLETIONRECORD:
        return getDiagnosticCompletionRecordInstances();
    case AFFECTEDJOBELEMENT:
        return getDiagnosticAffectedJobElementInstances();
    case SERVICERECORDAPPLIESTOELEMENT:
        return getServiceRecordAppliesToElementInstances();
    case COMPLETIONRECORDAPPLIESTOELEMENT:
        return getCompletionRecordAppliesToElementInstances();
    default:
        LOG(WARN, "Not supported class is requested.");
        return {};
    }
}

void DiagnosticHelper::append_tests(std::initializer_list<diag_test_id_t> ids, Fresh_Instances& tests) const
{
    for (const diag_test_id_t id : ids)
        tests.append(test_instance(id));
}

Array<Instance*> DiagnosticHelper::tests_of_class(classId_t id) const
{
    Fresh_Instances tests;
    const bool has_plug_tests = id == LOOPBACKDIAGNOSTICTEST || id == ETHLOOPBACKDIAGNOSTICTEST;
    const bool special = has_plug_tests && has_special_model();
    for (const Diagnostic_Test& test : diagnostic_tests()) {
        const bool withheld = special && (test.needs_plug || id == ETHLOOPBACKDIAGNOSTICTEST);
        if (test.class_id == id && !withheld)
            append_tests({test.id}, tests);
    }
    return tests.release();
}

Array<Instance*> DiagnosticHelper::getDiagnosticServices() const
{
    LOG_SCOPE("getDiagnosticServices");
    Fresh_Instances tests;
    append_tests({MEMORY_TEST, INTERNAL_LOOPBACK_TEST, SERDES_LOOPBACK_TEST}, tests);
    if (!has_special_model())
        append_tests({EXTERNAL_LOOPBACK_TEST, SERDES_ETH_LOOPBACK_TEST, EXTERNAL_ETH_LOOPBACK_TEST}, tests);
    append_tests({PCI_LOOPBACK_TEST}, tests);
    return tests.release();
}

DiagnosticJob DiagnosticHelper::createDiagnosticJob(const DiagnosticTestInput* input)
{
    LOG_SCOPE("createDiagnosticJob");
    DiagnosticJob job;
    static_cast<Tested_Element&>(job) = *input;
    job.instance_id = job_id_of(ProviderUtil::getDiagTestName(input->test_id), getNextJobID());
    job.start_time = Datetime::now();
    job.elapsed_time = Datetime(uint64(0));
    return job;
}

void DiagnosticHelper::addDiagnosticJob(const DiagnosticJob& job)
{
    LOG_SCOPE("addDiagnosticJob");
    const Auto_Mutex lock(_jobs.lock);
    _jobs.entries.clear();
    _jobs.entries.push_back(job);
}

bool DiagnosticHelper::isAnyJobRunning()
{
    LOG_SCOPE("isAnyJobRunning");
    const Auto_Mutex lock(_jobs.lock);
    return std::ranges::any_of(_jobs.entries,
                               [](const DiagnosticJob& job) { return job.job_state == JOB_RUNNING; });
}

void DiagnosticHelper::updateJobState(const String& job_id)
{
    LOG_SCOPE("updateJobState");
    const Auto_Mutex lock(_jobs.lock);
    const auto job = std::ranges::find_if(
        _jobs.entries, [&](const DiagnosticJob& each) { return each.instance_id.equali(job_id); });
    if (job == _jobs.entries.end())
        return;
    job->job_state = JOB_OVER;
    job->percent_complete = 100;
}

void DiagnosticHelper::generateDiagnosticRecord(const String& text, bool is_service,
                                                const DiagnosticTestInput* input,
                                                diag_compl_record_state_t state)
{
    LOG_SCOPE("generateDiagnosticRecord");
    constexpr uint16 SERVICE = 4, COMPLETION = 6;
    DiagnosticRecord record;
    static_cast<Tested_Element&>(record) = *input;
    record.is_service = is_service;
    record.instance_id = getInstanceIDForRecord(input->job_id, getNextRecordID());
    record.creation_time = Datetime::now();
    record.record_data = text;
    record.service_name = ProviderUtil::getDiagTestName(input->test_id);
    record.record_type = is_service ? SERVICE : COMPLETION;
    record.completion_state = state;
    addDiagnosticRecord(record);
}

void DiagnosticHelper::addDiagnosticRecord(const DiagnosticRecord& record)
{
    LOG_SCOPE("addDiagnosticRecord");
    List<DiagnosticRecord>& list = record.is_service ? _service_records : _completion_records;
    const Auto_Mutex lock(list.lock);
    list.entries.push_back(record);
    if (list.entries.size() > MOST_RECORDS)
        list.entries.erase(list.entries.begin());
}

} // namespace KPRV
