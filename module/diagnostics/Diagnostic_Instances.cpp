// Of `DiagnosticHelper`, what builds one instance: a test, a job, a record, the tests' software.
#include "module/diagnostics/DiagnosticHelper.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/KALDERA_DiagnosticCompletionRecord.h"
#include "module/schema/KALDERA_DiagnosticServiceRecord.h"

namespace KPRV {

namespace {

template <class T>
T* make_test(diag_test_id_t id, classId_t class_id)
{
    char system_name[256] = "";
    ProviderUtil::getHostInfo(system_name, sizeof system_name);
    const Diagnostic_Test* const test = find_diagnostic_test(id);
    Ref<T> instance(create<T>(true));
    set_system_keys(*instance, class_id, system_name);
    instance->Name.set(ProviderUtil::getDiagTestName(id));
    instance->ElementName.set(test ? test->element_name : "");
    instance->Characteristics.set(getDiagCharacteristics(id));
    instance->OtherCharacteristicDescription.set("");
    return instance.steal();
}

template <class T>
T* make_record(const DiagnosticRecord& record, const char* caption, const char* description,
               const String& element_name)
{
    Ref<T> instance(create<T>(true));
    instance->Caption.set(caption);
    instance->ElementName.set(caption);
    instance->Description.set(description);
    instance->InstanceID.set(record.instance_id);
    instance->CreationTimeStamp.set(record.creation_time);
    instance->RecordData.set(record.record_data);
    instance->ServiceName.set(record.service_name);
    instance->ManagedElementName.set(element_name);
    instance->RecordType.set(record.record_type);
    instance->RecordFormat.set("");
    return instance.steal();
}

} // namespace

KALDERA_MemoryDiagnosticTest* DiagnosticHelper::getMemoryDiagnosticTestInstance(diag_test_id_t test,
                                                                                classId_t id) const
{
    LOG_SCOPE("getMemoryDiagnosticTestInstance");
    return make_test<KALDERA_MemoryDiagnosticTest>(test, id);
}

KALDERA_LoopbackDiagnosticTest* DiagnosticHelper::getLoopbackDiagnosticTestInstance(diag_test_id_t test,
                                                                                    classId_t id) const
{
    LOG_SCOPE("getLoopbackDiagnosticTestInstance");
    return make_test<KALDERA_LoopbackDiagnosticTest>(test, id);
}

KALDERA_PCILoopbackDiagnosticTest* DiagnosticHelper::getPCILoopbackDiagnosticTestInstance(diag_test_id_t test,
                                                                                          classId_t id) const
{
    LOG_SCOPE("getPCILoopbackDiagnosticTestInstance");
    return make_test<KALDERA_PCILoopbackDiagnosticTest>(test, id);
}

KALDERA_EthLoopbackDiagnosticTest* DiagnosticHelper::getEthLoopbackDiagnosticTestInstance(diag_test_id_t test,
                                                                                          classId_t id) const
{
    LOG_SCOPE("getEthLoopbackDiagnosticTestInstance");
    return make_test<KALDERA_EthLoopbackDiagnosticTest>(test, id);
}

Instance* DiagnosticHelper::test_instance(diag_test_id_t id) const
{
    switch (const classId_t class_id = find_diagnostic_test(id)->class_id) {
    case MEMORYDIAGNOSTICTEST:
        return getMemoryDiagnosticTestInstance(id, class_id);
    case LOOPBACKDIAGNOSTICTEST:
        return getLoopbackDiagnosticTestInstance(id, class_id);
    case PCILOOPBACKDIAGNOSTICTEST:
        return getPCILoopbackDiagnosticTestInstance(id, class_id);
    default:
        return getEthLoopbackDiagnosticTestInstance(id, class_id);
    }
}

KALDERA_DiagnosticSoftwareIdentity* DiagnosticHelper::getDiagnosticSoftwareIdentityInstance() const
{
    LOG_SCOPE("getDiagnosticSoftwareIdentityInstance");
    const String version = ProviderUtil::getDriverVersion();
    Ref<KALDERA_DiagnosticSoftwareIdentity> identity(create<KALDERA_DiagnosticSoftwareIdentity>(true));
    identity->InstanceID.set("Kaldera:Diagnostic");
    identity->Caption.set("Diagnostic Software");
    identity->Description.set("Diagnostic Software");
    identity->ElementName.set("Diagnostic Software");
    identity->Name.set("KLDR Diagnostic Software");
    identity->VersionString.set(version);
    identity->Manufacturer.set("KLDR");
    identity->Classifications.set(array_of<uint16>({7}));
    identity->MajorVersion.set(2);
    identity->MinorVersion.set(2);
    identity->RevisionNumber.set(0);
    identity->BuildNumber.set(0);
    identity->IdentityInfoType.set(array_of<String>({"SoftwareID", "SoftwareStatus"}));
    identity->IdentityInfoValue.set(array_of<String>({"Diagnostic Software for Kaldera Adapter", "Primary"}));
    return identity.steal();
}

KALDERA_ConcreteJob* DiagnosticHelper::getConcreteJobInstance(const DiagnosticJob& job) const
{
    LOG_SCOPE("getConcreteJobInstance");
    // `TimeBeforeRemoval` stays at its default, on which nothing acts: the next job removes this one.
    Ref<KALDERA_ConcreteJob> instance(create<KALDERA_ConcreteJob>(true));
    instance->InstanceID.set(job.instance_id);
    instance->Name.set(job.instance_id);
    instance->JobState.set(job.job_state);
    instance->StartTime.set(job.start_time);
    instance->ElapsedTime.set(job.elapsed_time);
    instance->PercentComplete.set(job.percent_complete);
    return instance.steal();
}

Instance* DiagnosticHelper::getManagedElementInstance(const DiagnosticRecord& record) const
{
    LOG_SCOPE("getManagedElementInstance");
    return find_tested_element(record);
}

String DiagnosticHelper::getManagedElementName(const DiagnosticRecord& record) const
{
    LOG_SCOPE("getManagedElementName");
    const Ref<Instance> element(getManagedElementInstance(record));
    const CIM_ManagedElement* const managed = cast<CIM_ManagedElement>(element.ptr());
    return managed ? managed->ElementName.value : String();
}

Instance* DiagnosticHelper::getDiagnosticRecordInstance(const DiagnosticRecord& record) const
{
    LOG_SCOPE("getDiagnosticRecordInstance");
    const String element_name = getManagedElementName(record);
    if (record.is_service)
        return make_record<KALDERA_DiagnosticServiceRecord>(
            record, "Diagnostic Service Record",
            "This represents the data generated by the diagnostic service run", element_name);
    Ref<KALDERA_DiagnosticCompletionRecord> completion(make_record<KALDERA_DiagnosticCompletionRecord>(
        record, "Diagnostic Completion Record",
        "This represents the results generated by the diagnostic service run", element_name));
    completion->CompletionState.set(record.completion_state);
    return completion.steal();
}

} // namespace KPRV
