#include "module/alerts/IndicationHelper.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/ProviderUtil.h"
#include "module/runtime/system/log.h"

namespace KPRV {

constinit std::atomic<IndicationHelper*> IndicationHelper::indHelperObj = nullptr;

IndicationHelper* IndicationHelper::getIndicationHelperInstance()
{
    if (!indHelperObj)
        indHelperObj = &gIndicationHelperObj;
    return indHelperObj;
}

IndicationHelper::~IndicationHelper()
{
    LOG(DBG, "IndicatoinHelper destructor.");
    // A server may leave without stopping its providers; a delivery thread that still polls finds nothing.
    const Auto_Mutex lock(_queue_lock);
    _queued = 0;
    for (KALDERA_AlertIndication* alert : _queue)
        destroy(alert);
}

bool IndicationHelper::subscribeForEventNotifications()
{
    LOG_SCOPE("subscribeForEventNotifications");
    // The callback is armed before the catalogue is known: an event in between is an "Unknown" one.
    if (!registerForEvents())
        return false;
    try {
        initEventDetailsMaps();
    } catch (...) {
        // Nobody would ever disarm the callback of a subscription that does not come about.
        deRegisterForEvents();
        throw;
    }
    return true;
}

bool IndicationHelper::unsubscribeForEventNotifications()
{
    LOG_SCOPE("unsubscribeForEventNotifications");
    const bool deregistered = deRegisterForEvents();
    clearEventDetailsMaps();
    return deregistered;
}

namespace {

/// Sets the library's callback; false if it throws.
bool set_callback(evtProcessCB callback)
{
    return guarded(LOG_HERE, {"libRegisterEventProcessingCb"},
                   [&] { libRegisterEventProcessingCb(callback); });
}

} // namespace

bool IndicationHelper::registerForEvents()
{
    LOG_SCOPE("registerForEvents");
    Json::Value query(Json::objectValue);
    query["dropOldEvents"] = true;
    Json::Value answer;
    return guarded_call(LOG_HERE, {"libRegisterForEvents"}, libRegisterForEvents, query, answer) &&
           ProviderUtil::isValidJsonResponse(answer) && set_callback(providerHandleEvent);
}

bool IndicationHelper::deRegisterForEvents()
{
    LOG_SCOPE("deRegisterForEvents");
    set_callback(nullptr);
    Json::Value answer;
    return guarded_call(LOG_HERE, {"libUnRegisterForEvents"}, libUnRegisterForEvents, Json::Value(),
                        answer) &&
           ProviderUtil::isValidJsonResponse(answer);
}

// The poll is not traced: fifty times a second it would drown the log.
bool IndicationHelper::getIndicationObject(KALDERA_AlertIndication** alert)
{
    if (_queued == 0)
        return false;
    const Auto_Mutex lock(_queue_lock);
    if (_queue.empty())
        return false;
    *alert = _queue.front();
    _queue.pop_front();
    _queued = _queue.size();
    return true;
}

bool IndicationHelper::updateIndicationObjects(KALDERA_AlertIndication* alert)
{
    LOG_SCOPE("updateIndicationObjects");
    // Of all alerts of both kinds, across subscriptions.
    static sint32 evtSeqId GUARDED_BY(_queue_lock) = 0;
    const Auto_Mutex lock(_queue_lock);
    alert->SequenceNumber.set(++evtSeqId);
    _queue.push_back(alert);
    _queued = _queue.size();
    return true;
}

void IndicationHelper::initEventDetailsMaps()
{
    LOG_SCOPE("initEventDetailsMaps");
    _causes.fill([](const Event_Row& row) -> std::string { return row.cause; });
    _actions.fill([](const Event_Row& row) -> std::string { return row.action; });
    _message_ids.fill([](const Event_Row& row) { return message_id_of(row.key); });
}

void IndicationHelper::clearEventDetailsMaps()
{
    LOG_SCOPE("clearEventDetailsMaps");
    _causes.clear();
    _actions.clear();
}

} // namespace KPRV
