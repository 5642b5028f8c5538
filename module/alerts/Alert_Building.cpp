#include "module/alerts/Alert_Building.h"

#include "module/adapter/ProviderUtil.h"
#include "module/alerts/Element_Paths.h"
#include "module/alerts/Event_Categories.h"
#include "module/alerts/Perceived_Severity.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <cstdio>

namespace KPRV {

namespace {

// Values of the schema.
constexpr uint16 FORMAT_OBJECT_PATH = 2;
constexpr uint16 ALERT_TYPE_OTHER = 1;
constexpr uint16 ALERT_TYPE_COMMUNICATIONS = 2;
constexpr uint16 PROBABLE_CAUSE_OTHER = 1;

constexpr const char* OWN_ENTITY = "KALDERA";
constexpr const char* REGISTRY_ENTITY = "DMTF";

/// As the standard message registry words and owns them. The device's name is the first argument.
void follow_registry(KALDERA_AlertIndication& alert, const char* port_state)
{
    const String device = alert.MessageArguments.value[0];
    char message[256];
    snprintf(message, sizeof message, "The network port %s has been %s", device.c_str(), port_state);
    alert.Message.set(message);
    alert.OwningEntity.set(REGISTRY_ENTITY);
    alert.AlertType.set(ALERT_TYPE_COMMUNICATIONS);
    alert.OtherAlertType.set("");
}

} // namespace

KALDERA_AlertIndication* new_alert(const Adapter_Event& event)
{
    Ref<KALDERA_AlertIndication> alert(create<KALDERA_AlertIndication>(true));
    alert->AlertingElementFormat.set(FORMAT_OBJECT_PATH);
    alert->SystemCreationClassName.set(ProviderUtil::getClassName(COMPUTERSYSTEM));
    alert->SystemName.set(host_name_of_alerts());
    alert->ProviderName.set("kldrprovider");
    alert->EventTime.set(Datetime::now());
    alert->IndicationTime.set(Datetime::now());
    alert->OwningEntity.set(OWN_ENTITY);
    alert->AlertType.set(ALERT_TYPE_OTHER);
    alert->ProbableCause.set(PROBABLE_CAUSE_OTHER);
    alert->IndicationIdentifier.set(event.symbol);
    alert->EventID.set(event.symbol);
    alert->PerceivedSeverity.set(getPerceivedSeverity(event.severity));
    alert->Message.set(event.message);
    alert->MessageArguments.set({});
    return alert.steal();
}

void set_category(KALDERA_AlertIndication& alert, const Adapter_Event& event, const Category_Row& category)
{
    alert.AlertingManagedElement.set(category.element_path(event));
    alert.OtherAlertType.set(category.name);
    alert.Category.set(category.name);
}

void set_details(KALDERA_AlertIndication& alert, const Adapter_Event& event, const Detail_Row& details)
{
    for (const Message_Argument argument : details.arguments)
        if (const std::optional<String> word = argument ? argument(event) : std::nullopt)
            alert.MessageArguments.value.append(*word);
    if (details.severity)
        alert.PerceivedSeverity.set(details.severity);
    if (details.port_state)
        follow_registry(alert, details.port_state);
}

KALDERA_AlertIndication* copy_alert(const KALDERA_AlertIndication& alert)
{
    return clone_of(&alert);
}

void set_proprietary(KALDERA_AlertIndication& alert, const Adapter_Event& event, const String& message_id)
{
    alert.PerceivedSeverity.set(getExactPerceivedSeverity(event.severity));
    char id[16];
    snprintf(id, sizeof id, "PROP%s", message_id.c_str());
    alert.MessageID.set(id);
    alert.Message.set(event.message);
    alert.OwningEntity.set(OWN_ENTITY);
}

} // namespace KPRV
