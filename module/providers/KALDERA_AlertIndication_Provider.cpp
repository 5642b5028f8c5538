#include "module/adapter/Guarded_Call.h"
#include "module/alerts/Delivery_Pause.h"
#include "module/alerts/IndicationManager.h"
#include "module/providers/proc.h"
#include "module/runtime/dispatch/Thread.h"
#include "module/runtime/system/Module_Pin.h"
#include "module/runtime/system/log.h"
#include "module/schema/KALDERA_AlertIndication_Skeleton.h"

#include <atomic>
#include <memory>

namespace KPRV {

class KALDERA_AlertIndication_Provider : public KALDERA_AlertIndication_Skeleton
{
public:
    using Handler = Indication_Handler<KALDERA_AlertIndication>;

    Load_Status load()
    {
        LOG(DBG, "KALDERA_AlertIndication_Provider::load()");
        return LOAD_OK;
    }

    /// A server may unload without having disabled.
    Unload_Status unload()
    {
        LOG(DBG, "KALDERA_AlertIndication_Provider::unload()");
        if (_handler)
            disable_indications();
        return UNLOAD_OK;
    }

    Enable_Indications_Status enable_indications(Handler* handler)
    {
        LOG_SCOPE("enable_indications");
        std::unique_ptr<Handler> owner(handler);
        if (!IndicationManager::getIndicationManager()->subscribeForEventNotifications()) {
            LOG(ERR, "Subscribtion for event notifications FAILED.");
            return ENABLE_INDICATIONS_FAILED;
        }
        _handler = std::move(owner);
        LOG(INFO, "Subscribtion for event notifications is successful.");
        if (_continue == 0)
            _continue++;
        // A server may close the library without stopping its providers.
        _pin.hold();
        try {
            const int error = Thread::create_joinable(_thread, deliverIndications, this);
            if (error == 0)
                return ENABLE_INDICATIONS_OK;
            LOG(ERR, "Unable to create the indication thread: %d", error);
        } catch (...) {
            give_up();
            throw;
        }
        give_up();
        return ENABLE_INDICATIONS_FAILED;
    }

    Disable_Indications_Status disable_indications()
    {
        LOG_SCOPE("disable_indications");
        if (_continue == 0) {
            LOG(INFO, "No subscription for event notifications happened or successful");
            return DISABLE_INDICATIONS_OK;
        }
        if (IndicationManager::getIndicationManager()->unsubscribeForEventNotifications()) {
            LOG(INFO, "Unsubscribtion for event notifications is successful.");
        } else {
            LOG(ERR, "Un-subscribtion for event notifications FAILED.");
            LOG(INFO, "Continue to stop the thread created for listening to events");
        }
        _continue--;
        LOG(INFO, "Stopping the indication thread created.");
        void* result;
        Thread::join(_thread, result);
        if (_handler) {
            _handler->handle(nullptr);
            _handler.reset();
        }
        _pin.give_back();
        return DISABLE_INDICATIONS_OK;
    }

private:
    /// Undoes what was done for a subscription without a thread.
    void give_up()
    {
        IndicationManager::getIndicationManager()->unsubscribeForEventNotifications();
        _continue--;
        _handler.reset();
        _pin.give_back();
    }

    /// The delivery thread: at most one alert a pass. What is left in the queue when it stops is delivered in
    /// the next subscription.
    static void* deliverIndications(void* provider)
    {
        LOG_SCOPE("deliverIndications");
        auto* const self = static_cast<KALDERA_AlertIndication_Provider*>(provider);
        IndicationManager* const manager = IndicationManager::getIndicationManager();
        while (self->_continue != 0) {
            KALDERA_AlertIndication* alert = nullptr;
            if (manager->getIndicationObject(&alert)) {
                // The clone is the handler's. The alert itself stays allocated for the life of the process:
                // wanted so, and no leak to be mended.
                // Nobody above this thread could catch what a server throws, or a lack of memory.
                if (guarded(LOG_HERE, {"deliverIndications"},
                            [&] { self->_handler->handle(clone_of(alert)); }))
                    LOG(INFO, "Delivered indication to the CIM server");
            }
            Delivery_Pause::wait();
        }
        return nullptr;
    }

    Thread _thread;
    /// Held while the thread runs.
    Module_Pin _pin;
    /// 1 while the thread is to go on, which is as long as there is a subscription.
    std::atomic<uint32> _continue = 0;
    std::unique_ptr<Handler> _handler;
};

PROVIDER_PROC(KALDERA_AlertIndication)

} // namespace KPRV
