#include "simulator/Event_Reader.h"

#include "simulator/Inventory_Members.h"

namespace KPRV::simulator {

namespace {

Scripted_Event read_event(const Json_Text& source, Json::Value line)
{
    check_members(source, line, event_members, "an event");
    if (line.isMember("event") == line.isMember("text"))
        source.refuse(line, "an event needs either \"event\" or \"text\"");
    fill_defaults(line, event_members);
    return {std::chrono::milliseconds(line["after"].asUInt()), line["times"].asUInt(),
            std::chrono::milliseconds(line["every"].asUInt()),
            line.isMember("text") ? line["text"].asString() : compact_text(line["event"])};
}

} // namespace

std::vector<Scripted_Event> read_events(const Json_Text& source, const Json::Value& written)
{
    if (!written.isArray())
        source.refuse(written, "events must be an array");
    std::vector<Scripted_Event> script;
    for (const Json::Value& line : written)
        script.push_back(read_event(source, line));
    return script;
}

} // namespace KPRV::simulator
