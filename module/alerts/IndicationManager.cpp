#include "module/alerts/IndicationManager.h"

#include "module/adapter/ProviderUtil.h"
#include "module/alerts/IndicationHelper.h"
#include "module/runtime/system/log.h"

namespace KPRV {

constinit std::atomic<IndicationManager*> IndicationManager::indMgrObj = nullptr;

IndicationManager::IndicationManager() : _helper(IndicationHelper::getIndicationHelperInstance())
{
    LOG(DBG, "Inside IndicationManager Constructor");
}

IndicationManager::~IndicationManager()
{
    LOG(DBG, "Destructor for class IndicationManager");
}

IndicationManager* IndicationManager::getIndicationManager()
{
    if (!indMgrObj)
        indMgrObj = &gIndicationManagerObj;
    return indMgrObj;
}

bool IndicationManager::subscribeForEventNotifications()
{
    LOG_SCOPE("subscribeForEventNotifications");
    if (!ProviderUtil::getDriverStatus()) {
        LOG(ERR, "Driver is not installed or there is a zntl mismatch. Will not invoke subscription. ");
        return false;
    }
    return _helper->subscribeForEventNotifications();
}

bool IndicationManager::unsubscribeForEventNotifications()
{
    LOG_SCOPE("unsubscribeForEventNotifications");
    return _helper->unsubscribeForEventNotifications();
}

bool IndicationManager::getIndicationObject(KALDERA_AlertIndication** alert)
{
    return _helper->getIndicationObject(alert);
}

} // namespace KPRV
