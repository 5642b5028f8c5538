#include "module/adapter/ProviderInit.h"

#include "module/adapter/CIMProviderZntj.h"
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"

#include <cstring>

namespace KPRV {

constinit sint32 ProviderInit::driverStatus = 1;

namespace {

constexpr int APPLICATION_ID = 2;

/// The three digits are compared one by one and not as a version: 3.2.1 passes, 3.2.0 and 4.1.0 do not.
bool takes_log_callback(const char* version)
{
    const auto above = [version](int at, char digit) {
        return static_cast<signed char>(version[at]) > static_cast<signed char>(digit);
    };
    return version && strnlen(version, 5) == 5 && above(0, '2') && above(2, '1') && above(4, '0');
}

/// The library's `result`, -1 if it has none; true if it answered at all.
bool initialise(int& result)
{
    Json::Value request(Json::objectValue);
    request["appId"] = APPLICATION_ID;
    const Json::Value response = libInitHbaLib(request);
    if (!ProviderUtil::isValidJsonResponse(response))
        return false;
    result = -1;
    if (hasMember(response, "result"))
        guarded(LOG_HERE, {"libInitHbaLib"}, [&] { result = asInt(response["result"]); });
    return true;
}

} // namespace

ProviderInit::ProviderInit()
{
    LOG(DBG, "Inside ProviderInit Constructor.");
    setupDLLEntryPoints();

    const char* version = libGetAgtVersion();
    if (takes_log_callback(version))
        libRegisterLogMsgCb(&ProviderUtil::logMsg);
    const char* without = gZntjLibLoaded ? "Unknown" : "NOT Loaded";
    LOG(INFO, "ZNTJ Library version: %s", version ? version : without);

    driverStatus = 1;
    int result = -1;
    if (!initialise(result)) {
        LOG(ERR, "libInitHbaLib returns NULL response or has error");
        return;
    }
    if (result != 0) {
        LOG(ERR, "libInitHbaLib is failed - %d ", result);
        return;
    }
    const uint32 adapters = libGetNumOfAdapters();
    LOG(DBG, "Adapter Count = %d\n", static_cast<int>(adapters));
    driverStatus = adapters == 0 ? 1 : 0;
}

ProviderInit::~ProviderInit()
{
    LOG(DBG, "Inside ProviderInit Destructor.");
    // Nobody stands above a destructor: what left it would end the server.
    guarded(LOG_HERE, {"libFreeHbaLib"}, [] { libFreeHbaLib(); });
}

} // namespace KPRV
