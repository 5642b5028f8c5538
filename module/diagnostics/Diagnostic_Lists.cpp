// Of `DiagnosticHelper`, what publishes the jobs and records of all runs, and the associations among them.
#include "module/diagnostics/DiagnosticHelper.h"
#include "module/model/Fresh_Instances.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"
#include "module/schema/CIM_Job.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/CIM_RecordForLog.h"
#include "module/schema/KALDERA_AffectedJobElement.h"
#include "module/schema/KALDERA_CompletionRecordAppliesToElement.h"
#include "module/schema/KALDERA_ServiceRecordAppliesToElement.h"

namespace KPRV {

/// The lock stays for the whole read: writers wait while the entries look their elements up.
template <class T, class Make>
Array<Instance*> DiagnosticHelper::read(List<T>& list, Make make)
{
    Fresh_Instances instances;
    const Auto_Mutex lock(list.lock);
    for (const T& entry : list.entries)
        instances.append(make(entry));
    return instances.release();
}

namespace {

/// A record and its element. The element is null if it has gone.
template <class Pair>
Instance* applies_to_element(const DiagnosticHelper& helper, const DiagnosticRecord& record)
{
    Ref<Pair> pair(create<Pair>(true));
    pair->Antecedent = cast<CIM_RecordForLog>(helper.getDiagnosticRecordInstance(record));
    pair->Dependent = cast<CIM_ManagedElement>(helper.getManagedElementInstance(record));
    return pair.steal();
}

/// An element and the job that works on it. It counts among the results without an element, too, and then
/// says nothing.
Instance* affected_by(const DiagnosticHelper& helper, const DiagnosticJob& job)
{
    Ref<KALDERA_AffectedJobElement> pair(create<KALDERA_AffectedJobElement>(true));
    if (Ref<Instance> element{find_tested_element(job)}) {
        pair->AffectedElement = cast<CIM_ManagedElement>(element.steal());
        pair->AffectingElement = cast<CIM_Job>(static_cast<Instance*>(helper.getConcreteJobInstance(job)));
    }
    return pair.steal();
}

} // namespace

Array<Instance*> DiagnosticHelper::getDiagnosticJobInstances()
{
    LOG_SCOPE("getDiagnosticJobInstances");
    return read(_jobs, [&](const DiagnosticJob& job) { return getConcreteJobInstance(job); });
}

Array<Instance*> DiagnosticHelper::getDiagnosticServiceRecordInstances()
{
    LOG_SCOPE("getDiagnosticServiceRecordInstances");
    return read(_service_records,
                [&](const DiagnosticRecord& record) { return getDiagnosticRecordInstance(record); });
}

Array<Instance*> DiagnosticHelper::getDiagnosticCompletionRecordInstances()
{
    LOG_SCOPE("getDiagnosticCompletionRecordInstances");
    return read(_completion_records,
                [&](const DiagnosticRecord& record) { return getDiagnosticRecordInstance(record); });
}

Array<Instance*> DiagnosticHelper::getServiceRecordAppliesToElementInstances()
{
    LOG_SCOPE("getServiceRecordAppliesToElementInstances");
    return read(_service_records, [&](const DiagnosticRecord& record) {
        return applies_to_element<KALDERA_ServiceRecordAppliesToElement>(*this, record);
    });
}

Array<Instance*> DiagnosticHelper::getCompletionRecordAppliesToElementInstances()
{
    LOG_SCOPE("getCompletionRecordAppliesToElementInstances");
    return read(_completion_records, [&](const DiagnosticRecord& record) {
        return applies_to_element<KALDERA_CompletionRecordAppliesToElement>(*this, record);
    });
}

Array<Instance*> DiagnosticHelper::getDiagnosticAffectedJobElementInstances()
{
    LOG_SCOPE("getDiagnosticAffectedJobElementInstances");
    return read(_jobs, [&](const DiagnosticJob& job) { return affected_by(*this, job); });
}

} // namespace KPRV
