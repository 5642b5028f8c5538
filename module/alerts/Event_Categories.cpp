#include "module/alerts/Event_Categories.h"

#include "module/adapter/ProviderUtil.h"
#include "module/alerts/Element_Paths.h"
#include "module/alerts/Perceived_Severity.h"

#include <algorithm>
#include <iterator>

namespace KPRV {

namespace {

constexpr Event_Ids ids(int first, int last)
{
    Event_Ids set = 0;
    for (int id = first; id <= last; id++)
        set |= Event_Ids(1) << id;
    return set;
}

String fc_port(const Adapter_Event& event)
{
    return getFCPortObjectPath(event.port_index);
}
String base_port(const Adapter_Event& event)
{
    return getFCPortObjectPath(ProviderUtil::eraseColonsFromIndex(event.base_port_wwn));
}
String ethernet_port(const Adapter_Event& event)
{
    return getEthernetPortObjectPath(event.port_index);
}

constexpr const char* NOT_REGULAR = "Non supported event by regular provider is triggered.";
constexpr const char* NOT_SUPPORTED = "Not supported event is triggered.";
constexpr const char* NOT_SUPPORTED_PORT = "Unsupported event-port is triggered.";
constexpr const char* NOT_SUPPORTED_AUDIT = "unsupported eventr-audit is triggered.";

// clang-format off
constexpr Category_Row category_rows[] = {
//       name       element        accepted ids              standard  remark       refusal
    {2,  "Port",    fc_port,       ids(1, 2) | ids(4, 15),   true,     nullptr,     NOT_SUPPORTED_PORT},
    {3,  "Lport",   base_port,     ids(1, 2),                true,     nullptr,     NOT_SUPPORTED},
    {4,  "Rport",   base_port,     ids(1, 5),                false,    NOT_REGULAR, nullptr},
    {5,  "ITNIM",   base_port,     ids(1, 3),                false,    NOT_REGULAR, nullptr},
    {8,  "Audit",   fc_port,       ids(1, 2),                true,     nullptr,     NOT_SUPPORTED_AUDIT},
    {9,  "IOC",     base_port,     ids(1, 9),                false,    nullptr,     NOT_SUPPORTED},
    {10, "EthPort", ethernet_port, ids(1, 4),                true,     nullptr,     NOT_SUPPORTED},
};
// clang-format on

constexpr sint32 dropped_categories[] = {1, 6, 7, 11, 12};

std::optional<String> port_index(const Adapter_Event& event)
{
    return event.port_index;
}
std::optional<String> pom_level(const Adapter_Event& event)
{
    return event.pom_level;
}
std::optional<String> fabric_wwn(const Adapter_Event& event)
{
    return event.fabric_wwn;
}
std::optional<String> cee_state(const Adapter_Event& event)
{
    return event.cee_state;
}
std::optional<String> device_name(const Adapter_Event& event)
{
    return ProviderUtil::getEthDeviceNameByMAC(event.port_index);
}
std::optional<String> host_path(const Adapter_Event&)
{
    return getComputerSystemObjectPath();
}

constexpr sint32 ANY = -1;
constexpr uint16 AS_TOLD = 0;

// The first row that fits counts.
// clang-format off
constexpr Detail_Row detail_rows[] = {
//       id   arguments                  severity              port state
    {2,  6,   {pom_level, port_index},   AS_TOLD,              nullptr},
    {2,  13,  {port_index, fabric_wwn},  AS_TOLD,              nullptr},
    {2,  ANY, {port_index},              AS_TOLD,              nullptr},
    {3,  ANY, {},                        SEVERITY_INFORMATION, nullptr},
    {8,  ANY, {port_index},              AS_TOLD,              nullptr},
    {10, 1,   {cee_state},               AS_TOLD,              nullptr},
    {10, 2,   {port_index},              SEVERITY_CRITICAL,    nullptr},
    {10, 3,   {device_name, host_path},  SEVERITY_INFORMATION, "enabled"},
    {10, 4,   {device_name, host_path},  SEVERITY_WARNING,     "disabled"},
};
// clang-format on

} // namespace

const Category_Row* category_row(sint32 category)
{
    const auto* const row = std::ranges::find(category_rows, category, &Category_Row::category);
    return row == std::end(category_rows) ? nullptr : row;
}

bool is_dropped_category(sint32 category)
{
    return std::ranges::find(dropped_categories, category) != std::end(dropped_categories);
}

const Detail_Row* detail_row(sint32 category, sint32 id)
{
    const auto* const row = std::ranges::find_if(detail_rows, [&](const Detail_Row& each) {
        return each.category == category && (each.id == id || each.id == ANY);
    });
    return row == std::end(detail_rows) ? nullptr : row;
}

} // namespace KPRV
