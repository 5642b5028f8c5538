// TOY_Link, an association whose factories have the short names, and TOY_Alert, an indication with a worker.
#include "tests/broker/toy.h"

#include <thread>

namespace toy {

namespace {

CMPIObjectPath* link_path(const CMPIObjectPath* from)
{
    CMPIObjectPath* path =
        CMNewObjectPath(broker, CMGetCharPtr(CMGetNameSpace(from, nullptr)), "TOY_Link", nullptr);
    CMAddKey(path, "Antecedent", &from, CMPI_ref);
    return path;
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char*, const char*, const char* role, const char*,
                       const char**)
{
    // Filters without text come as null.
    if (role)
        return failed(CMPI_RC_ERR_INVALID_PARAMETER);
    CMReturnInstance(result, CMNewInstance(broker, path, nullptr));
    return CMReturnDone(result);
}

CMPIStatus associator_names(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                            const CMPIObjectPath* path, const char*, const char*, const char*, const char*)
{
    CMReturnObjectPath(result, path);
    return CMReturnDone(result);
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                      const CMPIObjectPath* path, const char*, const char*, const char**)
{
    CMReturnInstance(result, CMNewInstance(broker, link_path(path), nullptr));
    return CMReturnDone(result);
}

CMPIStatus reference_names(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path, const char*, const char*)
{
    CMReturnObjectPath(result, link_path(path));
    return CMReturnDone(result);
}

CMPIStatus link_cleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean)
{
    return ok;
}

CMPIAssociationMIFT link_table = {
    100, 100, nullptr, link_cleanup, associators, associator_names, references, reference_names};
CMPIAssociationMI link_mi = {nullptr, &link_table};

CMPIStatus filter_with_owner(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp* filter, const char*,
                             const CMPIObjectPath*, const char*)
{
    return filter->ft->getString(filter, nullptr) ? ok : failed(CMPI_RC_ERR_FAILED);
}

CMPIStatus must_poll(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                     const CMPIObjectPath*)
{
    return ok;
}

CMPIStatus count_filter(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                        const CMPIObjectPath* path, CMPIBoolean)
{
    return *CMGetCharPtr(CMGetNameSpace(path, nullptr)) ? ok : failed(CMPI_RC_ERR_INVALID_NAMESPACE);
}

/// One alert, delivered by a thread of its own.
CMPIStatus enable(CMPIIndicationMI*, const CMPIContext* caller)
{
    CMPIContext* context = CBPrepareAttachThread(broker, caller);
    std::thread([=] {
        CBAttachThread(broker, context);
        CMPIObjectPath* path = CMNewObjectPath(broker, "root/toy", "TOY_Alert", nullptr);
        CMPIInstance* alert = CMNewInstance(broker, path, nullptr);
        CMSetProperty(alert, "Text", "smoke", CMPI_chars);
        CBDeliverIndication(broker, context, "root/toy", alert);
        CMRelease(alert);
        CBDetachThread(broker, context);
    }).join();
    return ok;
}

CMPIStatus disable(CMPIIndicationMI*, const CMPIContext*)
{
    return ok;
}

CMPIStatus alert_cleanup(CMPIIndicationMI*, const CMPIContext*, CMPIBoolean)
{
    return ok;
}

CMPIIndicationMIFT alert_table = {100,       100,          nullptr,      alert_cleanup, filter_with_owner,
                                  must_poll, count_filter, count_filter, enable,        disable};
CMPIIndicationMI alert_mi = {nullptr, &alert_table};

/// A table in which only the cleanup is filled in.
CMPIIndicationMIFT silent_table = {100,     100,     nullptr, alert_cleanup, nullptr,
                                   nullptr, nullptr, nullptr, nullptr,       nullptr};
CMPIIndicationMI silent_mi = {nullptr, &silent_table};

} // namespace
} // namespace toy

TOY_EXPORT CMPIAssociationMI* TOY_Link_Create_AssociationMI(const CMPIBroker* mb, const CMPIContext*,
                                                            CMPIStatus*)
{
    toy::broker = mb;
    return &toy::link_mi;
}

TOY_EXPORT CMPIIndicationMI* TOY_Alert_Create_IndicationMI(const CMPIBroker* mb, const CMPIContext*,
                                                           CMPIStatus*)
{
    toy::broker = mb;
    return &toy::alert_mi;
}

TOY_EXPORT CMPIIndicationMI* TOY_Silent_Create_IndicationMI(const CMPIBroker* mb, const CMPIContext*,
                                                            CMPIStatus*)
{
    toy::broker = mb;
    return &toy::silent_mi;
}
