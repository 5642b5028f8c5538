#pragma once

#include "module/alerts/Adapter_Event.h"
#include "module/alerts/Event_Catalogue.h"
#include "module/runtime/system/Mutex.h"
#include "module/schema/KALDERA_AlertIndication.h"

#include <atomic>
#include <deque>

namespace KPRV {

/// The subscription to the adapter library's events, and the queue of finished alerts between the library's
/// threads, which fill it, and the delivery thread, which empties it.
///
/// How it works. The library calls `providerHandleEvent` on a thread of its own, many at once. The event is
/// read, its category says which alerts it gives, and each is built outside the lock; only the sequence
/// number and the place in the queue are given under it, so that numbers stand in the queue in their order.
/// The delivery thread looks fifty times a second: at a counter first, which costs no lock while nothing has
/// come. What it takes it hands on as a clone, and the alert itself stays allocated, as the server may keep
/// what it was given.
///
/// The two never wait for each other's work: building asks the library, delivering waits for the server, and
/// neither happens under the queue's lock. The queue has no bound; what was queued before a subscription
/// ended is delivered in the next one.
class IndicationHelper
{
public:
    IndicationHelper() = default;
    ~IndicationHelper();
    IndicationHelper(const IndicationHelper&) = delete;
    IndicationHelper& operator=(const IndicationHelper&) = delete;

    static IndicationHelper* getIndicationHelperInstance();

    /// Registers, and makes the catalogue known. False if the library refuses.
    bool subscribeForEventNotifications();
    /// Deregisters, and forgets the catalogue whatever the library says. False if it refuses.
    bool unsubscribeForEventNotifications();

    /// Asks for events from now on, and arms the callback. False if the library refuses or throws; the
    /// callback is then not armed.
    bool registerForEvents();
    /// Disarms the callback, then asks for no more events. False if the library refuses or throws; the
    /// callback stays disarmed.
    bool deRegisterForEvents();

    /// Takes the oldest alert out of the queue; false, without taking the lock, if there is none. The alert
    /// stays allocated: see `KALDERA_AlertIndication_Provider`.
    bool getIndicationObject(KALDERA_AlertIndication** alert);
    /// Gives the alert the next sequence number and puts it at the end of the queue, which owns it. True.
    bool updateIndicationObjects(KALDERA_AlertIndication* alert);

    /// Turns one event into its alerts, a standard one, a proprietary one or both, and queues them. 1 if
    /// there was one, else 0. A member of the wrong type throws `Not_Convertible`, to the library.
    int processEvent(const char* text);

    void initEventDetailsMaps();
    /// The message ids stay.
    void clearEventDetailsMaps();
    // Of an event key; "Unknown" for one that is not known. Causes and actions are known during a
    // subscription, message ids from the first one on.
    String getEventCauseById(sint32 key) const { return _causes.find(key); }
    String getEventActionById(sint32 key) const { return _actions.find(key); }
    String getMessageIDById(sint32 key) const { return _message_ids.find(key); }

private:
    /// Looks the key up and completes the alert; gives the message id.
    String set_catalogue_texts(KALDERA_AlertIndication& alert, sint32 key) const;

    static std::atomic<IndicationHelper*> indHelperObj;

    Event_Texts _causes;
    Event_Texts _actions;
    Event_Texts _message_ids;
    std::deque<KALDERA_AlertIndication*> _queue GUARDED_BY(_queue_lock);
    /// Size of the queue, for a look without the lock.
    std::atomic<size_t> _queued = 0;
    Mutex _queue_lock;
};

extern IndicationHelper gIndicationHelperObj;

/// What the library calls for each event, on threads of its own.
void providerHandleEvent(const char* text);

} // namespace KPRV
