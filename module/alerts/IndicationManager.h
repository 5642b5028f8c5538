#pragma once

#include "module/schema/KALDERA_AlertIndication.h"

#include <atomic>

namespace KPRV {

class IndicationHelper;

/// The front of the alerts for their provider: guards the subscription, forwards the rest.
class IndicationManager
{
public:
    IndicationManager();
    ~IndicationManager();
    IndicationManager(const IndicationManager&) = delete;
    IndicationManager& operator=(const IndicationManager&) = delete;

    static IndicationManager* getIndicationManager();

    /// False, without asking the library, if the driver is missing or does not match; else as the helper's.
    bool subscribeForEventNotifications();
    bool unsubscribeForEventNotifications();
    /// Takes the oldest alert out of the queue; false if there is none.
    bool getIndicationObject(KALDERA_AlertIndication** alert);

private:
    static std::atomic<IndicationManager*> indMgrObj;

    IndicationHelper* const _helper;
};

extern IndicationManager gIndicationManagerObj;

} // namespace KPRV
