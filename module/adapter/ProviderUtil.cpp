#include "module/adapter/ProviderUtil.h"

#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderInit.h"
#include "module/adapter/ProviderUtil_Log.h"

#include <cstdio>
#include <iterator>

namespace KPRV {

namespace {

constinit ProviderUtil gProviderUtilObj;

} // namespace

ProviderUtil* ProviderUtil::getProviderUtil()
{
    return &gProviderUtilObj;
}

bool ProviderUtil::isValidJsonResponse(const Json::Value& response)
{
    return !response.isNull() && !hasMember(response, "error");
}

bool ProviderUtil::getDriverStatus()
{
    const sint32 status = ProviderInit::getDriverStatus();
    return status != 2 && status != 3;
}

void ProviderUtil::logMsg(int level, const char* file, int line, const char* text)
{
    // The library's levels 1 to 5; level 5 has no equal here and is worth no more than INFO.
    constexpr Log_Level levels[] = {Log_Level::DBG,  Log_Level::DBG, Log_Level::INFO,
                                    Log_Level::WARN, Log_Level::ERR, Log_Level::INFO};
    const size_t index = level;
    const Log_Level own = index < std::size(levels) ? levels[index] : Log_Level::DBG;

    char head[32];
    snprintf(head, sizeof head, "%s:%d ", file ? file : "", line);
    const Call_Site here = UTIL_HERE;
    log(own, here.file, here.line, "%s%s", head, text ? text : "");
}

} // namespace KPRV
