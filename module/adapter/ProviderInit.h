#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// One-time start and end of the adapter library, by the life of the one object `gProviderInit`: while the
/// module loads, before any request, and when it is unloaded. No retry: adapters that come later are served
/// all the same, since each request asks the library anew.
class ProviderInit
{
public:
    /// Opens the library, gives it the log callback if it is new enough, initialises it and counts the
    /// adapters. A host without library, driver or adapters stops nothing; the log tells. `init_hba_lib` and
    /// `getNumberOfAdapters` must not throw: nothing stands between them and the loader.
    ProviderInit();
    /// Says goodbye to the library.
    ~ProviderInit();
    ProviderInit(const ProviderInit&) = delete;
    ProviderInit& operator=(const ProviderInit&) = delete;

    /// 0: initialised, with adapters. 1: not initialised, or none. 2 and 3: a missing or a mismatched driver,
    /// which nothing stores today; the managers refuse them.
    static sint32 getDriverStatus() { return driverStatus; }

private:
    static sint32 driverStatus;

    friend struct Driver_Status_Override;
};

extern ProviderInit gProviderInit;

} // namespace KPRV
