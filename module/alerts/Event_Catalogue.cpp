#include "module/alerts/Event_Catalogue.h"

#include "module/alerts/Adapter_Event.h"

#include <cstdio>

namespace KPRV {

namespace {

constexpr Event_Row rows[] = {
#define EVENT(category, id, cause, action) {event_key(category, id), cause, action},
#include "module/alerts/Event_Catalogue.def"
#undef EVENT
};

/// Events that the standard message registry of platform alerts knows, with its numbers.
struct Registry_Row
{
    sint32 key;
    int number;
};
constexpr Registry_Row registry_rows[] = {
    {event_key(10, 3), 260},
    {event_key(10, 4), 261},
};

std::string numbered(const char* prefix, int number)
{
    char text[16];
    snprintf(text, sizeof text, "%s%d", prefix, number);
    return text;
}

} // namespace

std::span<const Event_Row> event_rows()
{
    return rows;
}

std::string proprietary_message_id(sint32 key)
{
    return numbered("KLDR", key);
}

std::string message_id_of(sint32 key)
{
    for (const Registry_Row& row : registry_rows)
        if (row.key == key)
            return numbered("PLAT", row.number);
    return proprietary_message_id(key);
}

void Event_Texts::fill(std::string (*text_of)(const Event_Row& row))
{
    if (_texts.empty()) {
        // Whole or not at all: what is there already is not filled again.
        std::map<sint32, std::string> texts;
        for (const Event_Row& row : rows)
            texts[row.key] = text_of(row);
        _texts.swap(texts);
    }
    _filled = true;
}

String Event_Texts::find(sint32 key) const
{
    if (!_filled)
        return "Unknown";
    const auto found = _texts.find(key);
    return found == _texts.end() ? "Unknown" : found->second.c_str();
}

} // namespace KPRV
