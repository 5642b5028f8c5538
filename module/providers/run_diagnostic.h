#pragma once

#include "module/diagnostics/DiagnosticHelper.h"
#include "module/providers/managers.h"
#include "module/runtime/dispatch/provider_status.h"
#include "module/runtime/system/log.h"
#include "module/schema/CIM_ConcreteJob.h"
#include "module/schema/CIM_ManagedElement.h"

#include <strings.h>

namespace KPRV {

/// The skeleton of a test's provider, of which `Method` is the class's own record of `RunDiagnostic`. The
/// method has parameters of its own in other classes, and a client may name one of those in its path: such a
/// call is not supported, rather than read as if it were the class's own.
template <class Skeleton, class Method>
class Test_Skeleton : public Skeleton
{
public:
    template <class Provider>
    static int invoke(Provider& provider, const typename Skeleton::Class* self, Instance* method)
    {
        const Meta_Class* const own = reinterpret_cast<const Meta_Class*>(&Method::static_meta_class);
        if (strcasecmp(method->__meta_class->name, "RunDiagnostic") == 0 && method->__meta_class != own)
            return INVOKE_METHOD_UNSUPPORTED;
        return Skeleton::invoke(provider, self, method);
    }
};

/// The element as the class, if its class has just the expected name; else null.
template <class Element>
const Element* tested_as(const CIM_ManagedElement* element)
{
    return element && strcasecmp(element->__meta_class->name, Element::static_meta_class.name) == 0
               ? cast<Element>(static_cast<const Instance*>(element))
               : nullptr;
}

/// The answer of `RunDiagnostic`. The method itself never fails: its outcome is the return value.
class Run_Answer
{
public:
    Run_Answer(Call_Site site, CIM_ConcreteJob*& job, Property<uint32>& return_value)
        : _site(site), _job(job), _return_value(return_value)
    {
    }

    Invoke_Method_Status wrong_element() const
    {
        log(Log_Level::ERR, _site.file, _site.line, "Error: Invalid input object path!");
        return answer({RUN_INVALID_PARAMETER, nullptr});
    }
    Invoke_Method_Status of(const Run_Result& result) const
    {
        log(Log_Level::INFO, _site.file, _site.line, "Return value: %d", static_cast<int>(result.code));
        return answer(result);
    }

private:
    Invoke_Method_Status answer(const Run_Result& result) const
    {
        _job = cast<CIM_ConcreteJob>(static_cast<Instance*>(result.job));
        _return_value.set(result.code);
        return INVOKE_METHOD_OK;
    }

    Call_Site _site;
    CIM_ConcreteJob*& _job;
    Property<uint32>& _return_value;
};

inline DiagnosticHelper* diagnostic_helper()
{
    return FCHBAManager::getFCHBAManager()->getDiagnosticHelper();
}

} // namespace KPRV
