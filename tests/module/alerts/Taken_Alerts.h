#pragma once

#include "module/alerts/IndicationHelper.h"
#include "module/runtime/objects/Ref.h"
#include "tests/support/Instance_Text.h"

#include <vector>

namespace KPRV {

using Alert = Ref<KALDERA_AlertIndication>;

/// All alerts that wait in the queue, oldest first.
inline std::vector<Alert> take_alerts(IndicationHelper& helper)
{
    std::vector<Alert> alerts;
    KALDERA_AlertIndication* alert = nullptr;
    while (helper.getIndicationObject(&alert))
        alerts.emplace_back(alert);
    return alerts;
}

/// One property as text, "(null)" without a value.
inline std::string text_of(const Alert& alert, const char* property)
{
    const Set_Properties properties = set_properties(alert.ptr());
    const auto found = properties.find(property);
    return found == properties.end() ? "(null)" : found->second;
}

/// One property of each, in order.
inline std::vector<std::string> texts_of(const std::vector<Alert>& alerts, const char* property)
{
    std::vector<std::string> texts;
    for (const Alert& alert : alerts)
        texts.push_back(text_of(alert, property));
    return texts;
}

} // namespace KPRV
