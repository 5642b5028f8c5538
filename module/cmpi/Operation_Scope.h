#pragma once

#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/runtime/dispatch/Request_Scope.h"
#include "module/runtime/system/log.h"

namespace KPRV {

/// The frame of an operation: the thread's context is pushed, then the provider is locked, then the entry is
/// traced; the end of the scope unlocks and pops, also when an exception passes. What an operation creates
/// is declared behind its scope and so released before the lock.
///
/// How it works. Its members are the frame, in the order in which C++ makes them and backwards ends them. The
/// context comes first: up-calls of the operation find broker and context on top of their thread's stack.
/// Then the provider's mutex, recursive, since an up-call may come back into the same provider on the same
/// thread. It is held until the entry returns, so that one provider runs one operation at a time. Exceptions
/// pass through and unwind it; so does a thread that is cancelled.
class SCOPED_CAPABILITY Operation_Scope
{
public:
    /// `function` is the name in the trace.
    Operation_Scope(CMPI_Adapter* adapter, const CMPIContext* context, const char* function, Call_Site site)
        ACQUIRE(adapter->adapter_mutex);
    ~Operation_Scope() RELEASE() {}
    Operation_Scope(const Operation_Scope&) = delete;
    Operation_Scope& operator=(const Operation_Scope&) = delete;

    CMPI_Adapter* adapter() const { return _adapter; }
    const CMPIBroker* broker() const { return _adapter->broker; }

    /// Traces the return and gives the status of the entry; its message is always null.
    CMPIStatus ret(Call_Site site, CMPIrc rc) const;
    CMPIStatus ret(Call_Site site, CMPIrc rc, const char* text) const;
    /// For the entries that trace one code and return another.
    CMPIStatus ret_ok(Call_Site site, CMPIrc traced) const;

private:
    CMPI_Adapter* _adapter;
    const char* _function;
    Request_Scope _request;
    Context_Scope _context;
    Auto_Mutex _lock;
};

} // namespace KPRV
