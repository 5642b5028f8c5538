#pragma once

#include "module/alerts/Adapter_Event.h"
#include "module/schema/KALDERA_AlertIndication.h"

namespace KPRV {

struct Category_Row;
struct Detail_Row;

/// A fresh alert with what every alert says of its event. The caller owns it.
KALDERA_AlertIndication* new_alert(const Adapter_Event& event);

/// Says what the alert is about, as the event's category tells it.
void set_category(KALDERA_AlertIndication& alert, const Adapter_Event& event, const Category_Row& category);

/// Adds what is told of single events; the message arguments are the words that the event has.
void set_details(KALDERA_AlertIndication& alert, const Adapter_Event& event, const Detail_Row& details);

/// The alert once more. The caller owns it.
KALDERA_AlertIndication* copy_alert(const KALDERA_AlertIndication& alert);

/// Makes an alert the proprietary one of its event: severity and message as the library tells them, an id of
/// the product's own.
void set_proprietary(KALDERA_AlertIndication& alert, const Adapter_Event& event, const String& message_id);

} // namespace KPRV
