#include "module/update/SoftwareUpdateHelper.h"

#include "module/adapter/CIMProviderZntj.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"

namespace KPRV {

namespace {

constexpr const char* SERVICE_NAME = "Kaldera Adapter Software Update Service";

// Codes of the schema.
constexpr uint16 OPTION_INSTALL = 4;
constexpr uint16 OPTION_UPDATE = 5;
constexpr uint16 SCHEME_FILE = 3;
constexpr uint16 SCHEME_TFTP = 8;
constexpr uint16 ACTION_INSTALL_FROM_URI = 5;

} // namespace

SoftwareUpdateHelper::SoftwareUpdateHelper() : _life("SoftwareUpdateHelper", LOG_HERE) {}

SoftwareUpdateHelper* SoftwareUpdateHelper::getSoftwareUpdateHelperInstance()
{
    static SoftwareUpdateHelper helper;
    return &helper;
}

Array<Instance*> SoftwareUpdateHelper::getInstancesByClass(classId_t id) const
{
    LOG_SCOPE("getInstancesByClass");
    char system_name[255] = {};
    ProviderUtil::getHostInfo(system_name, sizeof system_name);
    Fresh_Instances instances;
    if (id == HBASOFTWAREINSTALLATIONSERVICE)
        instances.append(getHBASoftwareInstallationServiceInstance(system_name));
    else if (id == HBASOFTWAREINSTALLATIONSERVICECAPABILITIES)
        instances.append(getHBASoftwareInstallationServiceCapabilitiesInstance());
    else
        LOG(INFO, "Default case . Other classes ");
    LOG(INFO, "Number of instances: %d", static_cast<int>(instances.size()));
    return instances.release();
}

KALDERA_HBASoftwareInstallationService*
SoftwareUpdateHelper::getHBASoftwareInstallationServiceInstance(const char* system_name) const
{
    LOG_SCOPE("getHBASoftwareInstallationServiceInstance");
    Ref<KALDERA_HBASoftwareInstallationService> service(
        create_null<KALDERA_HBASoftwareInstallationService>());
    set_system_keys(*service, HBASOFTWAREINSTALLATIONSERVICE, system_name);
    service->Name.set(SERVICE_NAME);
    return service.steal();
}

KALDERA_HBASoftwareInstallationServiceCapabilities*
SoftwareUpdateHelper::getHBASoftwareInstallationServiceCapabilitiesInstance() const
{
    LOG_SCOPE("getHBASoftwareInstallationServiceCapabilitiesInstance");
    Ref<KALDERA_HBASoftwareInstallationServiceCapabilities> capabilities(
        create_null<KALDERA_HBASoftwareInstallationServiceCapabilities>());
    capabilities->InstanceID.set(SERVICE_NAME);
    capabilities->SupportedInstallOptions.set(array_of({OPTION_INSTALL, OPTION_UPDATE}));
    capabilities->SupportedURISchemes.set(array_of({SCHEME_FILE, SCHEME_TFTP}));
    capabilities->SupportedSynchronousActions.set(array_of({ACTION_INSTALL_FROM_URI}));
    return capabilities.steal();
}

uint32 SoftwareUpdateHelper::UpdatePortControllerSoftware(const KALDERA_PortController* controller,
                                                          const char* file) const
{
    LOG_SCOPE("UpdatePortControllerSoftware");
    const String& id = controller->DeviceID.value;
    LOG(DBG, "UpdatePortControllerSoftware portType=%d deviceid=%s file=%s\n",
        int(controller->ControllerType.value), id.c_str(), file);
    Json::Value request(Json::objectValue);
    request["indexStr"] = ProviderUtil::getIndexInColonFormat(id).c_str();
    request["file"] = file;
    const Json::Value answer = libAdapterUpdateFlash(request);
    if (!ProviderUtil::isValidJsonResponse(answer) || !hasMember(answer, "status") ||
        !hasMember(answer, "message")) {
        LOG(ERR, "libAdapterUpdateFlash is failed.");
        return NO_STATUS;
    }
    const uint32 status = asUInt(answer["status"]);
    const std::string_view message = asView(answer["message"]);
    LOG(DBG, "status=%d message = %.*s\n", int(status), int(message.size()), message.data());
    return status;
}

} // namespace KPRV
