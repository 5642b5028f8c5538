#include "module/adapter/ProviderUtil.h"
#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/runtime/system/forced_unwinding.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/KALDERA_HBASoftwareInstallationService_Skeleton.h"
#include "module/schema/KALDERA_PortController.h"
#include "module/update/Firmware_Uri.h"
#include "module/update/Install_Failure.h"
#include "module/update/SoftwareUpdateHelper.h"

namespace KPRV {

namespace {

/// What the method returns: a client learns that it failed, and the log why.
constexpr uint32 INSTALL_DONE = 0;
constexpr uint32 INSTALL_FAILED = 2;

/// Of `InstallOptions`: the first element says what is asked for.
constexpr uint16 INSTALL_OPTION_INSTALL = 4;
constexpr uint16 INSTALL_OPTION_UPDATE = 5;

void check_arguments(const String& uri, const CIM_ManagedElement* target, const Array<uint16>& options)
{
    if (uri.empty()) {
        LOG(ERR, "URI.value is empty");
        throw Install_Failure{"empty input parameters"};
    }
    if (!target) {
        LOG(ERR, "Target is empty");
        throw Install_Failure{"empty input parameters"};
    }
    if (options.size() == 0) {
        LOG(ERR, "InstallOptions.value.size() is  0");
        throw Install_Failure{"empty input parameters"};
    }
    if (options[0] != INSTALL_OPTION_INSTALL && options[0] != INSTALL_OPTION_UPDATE) {
        LOG(ERR, "InstallOptions[0] validation failed. throw invalide option type");
        throw Install_Failure{"invalid option type"};
    }
}

/// The first controller with the target's keys, whatever the target's class; null if there is none.
const KALDERA_PortController* find_target(const List<KALDERA_PortController>& controllers,
                                          const CIM_ManagedElement* target)
{
    for (uint32 i = 0; i < controllers.size(); i++) {
        const KALDERA_PortController* controller = controllers[i];
        if (controller && key_eq(controller, target))
            return controller;
    }
    return nullptr;
}

void update_target(const CIM_ManagedElement* target, const String& file)
{
    const List<KALDERA_PortController> controllers(fc_hba_instances(PORTCONTROLLER));
    const KALDERA_PortController* controller = find_target(controllers, target);
    if (!controller) {
        LOG(ERR, "Couldnt find the matching port controller.");
        throw Install_Failure{"Could not find target controller"};
    }
    const SoftwareUpdateHelper* helper = SoftwareUpdateHelper::getSoftwareUpdateHelperInstance();
    if (helper->UpdatePortControllerSoftware(controller, file.c_str()) != 0) {
        LOG(ERR, "UpdatePortControllerSoftware method failed");
        throw Install_Failure{"controller update failed"};
    }
    LOG(DBG, "Software update is success");
}

void install(const String& uri, const CIM_ManagedElement* target, const Array<uint16>& options)
{
    check_arguments(uri, target, options);
    const String file = fetch_firmware(uri);
    if (!ProviderUtil::IsFileExist(file.c_str())) {
        LOG(ERR, "File doesnt exist");
        throw Install_Failure{"File not exists"};
    }
    update_target(target, file);
}

} // namespace

class KALDERA_HBASoftwareInstallationService_Provider : public KALDERA_HBASoftwareInstallationService_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_HBASoftwareInstallationService*,
                   Enum_Instances_Handler<KALDERA_HBASoftwareInstallationService>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_one(fc_hba_instances(HBASOFTWAREINSTALLATIONSERVICE, handler->wanted()), *handler,
                           SAYING(ERR, "Error: Invalid mapping information"), ENUM_INSTANCES_OK);
    }

    /// Waits for the download and the update: there is never a job.
    Invoke_Method_Status InstallFromURI(const KALDERA_HBASoftwareInstallationService*, CIM_ConcreteJob*&,
                                        const Property<String>& URI, const CIM_ManagedElement* Target,
                                        const Property<Array<uint16>>& InstallOptions,
                                        const Property<Array<String>>&, Property<uint32>& return_value)
    {
        LOG_SCOPE("InstallFromURI");
        return_value.set(INSTALL_FAILED);
        try {
            install(URI.value, Target, InstallOptions.value);
            return_value.set(INSTALL_DONE);
        } catch (const Install_Failure& failure) {
            LOG(DBG, "InstallFromURI : ERROR - %s", failure.text);
        } catch (...) {
            rethrow_forced_unwinding();
            LOG(DBG, "InstallFromURI : ERROR - unknown Exception");
        }
        LOG(DBG, "return value = %d\n", int(return_value.value));
        return INVOKE_METHOD_OK;
    }
};

PROVIDER_PROC(KALDERA_HBASoftwareInstallationService)

} // namespace KPRV
