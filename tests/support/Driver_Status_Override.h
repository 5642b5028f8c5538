#pragma once

#include "module/adapter/ProviderInit.h"

namespace KPRV {

/// Sets the driver's status for a scope: nothing in the product stores the values that its guard refuses.
struct Driver_Status_Override
{
    explicit Driver_Status_Override(sint32 status) : old(ProviderInit::driverStatus)
    {
        ProviderInit::driverStatus = status;
    }
    ~Driver_Status_Override() { ProviderInit::driverStatus = old; }
    Driver_Status_Override(const Driver_Status_Override&) = delete;
    Driver_Status_Override& operator=(const Driver_Status_Override&) = delete;

    const sint32 old;
};

} // namespace KPRV
