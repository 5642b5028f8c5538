#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/schema/KALDERA_HBASoftwareInstallationService.h"
#include "module/schema/KALDERA_HBASoftwareInstallationServiceCapabilities.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

/// Publishes the service that installs firmware, and hands an image to the adapter library. Nothing is kept
/// between calls, and nothing keeps two updates apart. Instances belong to the caller; what the builders do
/// not name is null.
class SoftwareUpdateHelper
{
public:
    /// What `UpdatePortControllerSoftware` gives where the library reports no status of its own.
    static constexpr uint32 NO_STATUS = ~uint32(0);

    static SoftwareUpdateHelper* getSoftwareUpdateHelperInstance();

    /// The service (id 18) or its capabilities (id 19), one instance; none for any other id.
    Array<Instance*> getInstancesByClass(classId_t id) const;

    /// `SystemName` is the host's address or name, as in the instance of the host.
    KALDERA_HBASoftwareInstallationService*
    getHBASoftwareInstallationServiceInstance(const char* system_name) const;
    /// Install and update, from file and tftp URIs, while the client waits.
    KALDERA_HBASoftwareInstallationServiceCapabilities*
    getHBASoftwareInstallationServiceCapabilitiesInstance() const;

    /// Writes the image to the adapter's flash by `libAdapterUpdateFlash`, which blocks as long as that
    /// takes. Gives the library's `status`, 0 for success, or `NO_STATUS` for an answer that is an error or
    /// lacks `status` or `message`. The library's exceptions pass, as does `Not_Convertible` for members of
    /// the wrong type.
    uint32 UpdatePortControllerSoftware(const KALDERA_PortController* controller, const char* file) const;

private:
    SoftwareUpdateHelper();

    const Logged_Life _life;
};

} // namespace KPRV
