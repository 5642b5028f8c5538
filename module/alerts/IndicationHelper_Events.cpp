// Of `IndicationHelper`, the way of one event: read, matched with its category, filled with texts, queued.
#include "module/alerts/Alert_Building.h"
#include "module/alerts/Event_Categories.h"
#include "module/alerts/IndicationHelper.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

namespace KPRV {

namespace {

/// Which alerts an event gives, and where the catalogue has its texts.
struct Verdict
{
    bool standard = false;
    bool proprietary = false;
    sint32 key = 0;
};

/// Applies the category's row to the alert.
Verdict apply_category(KALDERA_AlertIndication& alert, const Adapter_Event& event)
{
    if (is_dropped_category(event.category))
        return {};
    const Category_Row* const row = category_row(event.category);
    if (!row)
        return {true, true, 0};
    if (row->remark)
        LOG(WARN, "%s", row->remark);
    set_category(alert, event, *row);
    const sint32 key = event_key(event.category, event.id);
    if (!row->accepts(event.id)) {
        if (row->refusal)
            LOG(WARN, "%s", row->refusal);
        return {false, false, key};
    }
    if (const Detail_Row* const details = detail_row(event.category, event.id))
        set_details(alert, event, *details);
    return {row->is_standard, true, key};
}

/// Only the standard alert bears an id of the standard message registry.
bool is_registry_event(const Adapter_Event& event)
{
    const Detail_Row* const details = detail_row(event.category, event.id);
    return details && details->port_state;
}

} // namespace

String IndicationHelper::set_catalogue_texts(KALDERA_AlertIndication& alert, sint32 key) const
{
    const String cause = getEventCauseById(key);
    alert.Description.set(cause);
    alert.ProbableCauseDescription.set(cause);
    Array<String> actions;
    actions.append(getEventActionById(key));
    alert.RecommendedActions.set(actions);
    String message_id = getMessageIDById(key);
    alert.MessageID.set(message_id);
    LOG(INFO, "Message ID = %s", message_id.c_str());
    return message_id;
}

int IndicationHelper::processEvent(const char* text)
{
    // "Returning" is said only where an alert goes out.
    LOG(DBG, "Entering: %s", "processEvent");
    Adapter_Event event;
    if (!read_adapter_event(text, event))
        return 0;

    Ref<KALDERA_AlertIndication> alert(new_alert(event));
    // Routine lines, yet at this level: support looks for them where nothing finer is logged.
    LOG(WARN, "Before event category switch : %d", event.category);
    LOG(WARN, "Event ID  : %d", event.id);
    const Verdict verdict = apply_category(*alert, event);
    String message_id = set_catalogue_texts(*alert, verdict.key);
    if (!verdict.standard && !verdict.proprietary) {
        LOG(WARN, "Invoked with a unsporrted or invalid event");
        return 0;
    }

    // Copied before the queue owns the alert. The standard one goes first.
    Ref<KALDERA_AlertIndication> proprietary(copy_alert(*alert));
    // A queue that has no room leaves the alert here.
    if (verdict.standard) {
        updateIndicationObjects(alert.ptr());
        alert.steal();
    }
    if (verdict.proprietary) {
        if (is_registry_event(event))
            message_id = proprietary_message_id(verdict.key).c_str();
        set_proprietary(*proprietary, event, message_id);
        LOG(INFO, "Updating kldrIndication");
        updateIndicationObjects(proprietary.ptr());
        proprietary.steal();
    }
    LOG(DBG, "Returning: %s", "processEvent");
    return 1;
}

void providerHandleEvent(const char* text)
{
    IndicationHelper::getIndicationHelperInstance()->processEvent(text);
}

} // namespace KPRV
