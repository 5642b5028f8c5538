#include "simulator/Optics_Reader.h"

#include "simulator/Inventory_Members.h"

namespace KPRV::simulator {

namespace {

// Lengths of the text fields in the memory of an SFP.
constexpr std::size_t NAME_LENGTH = 16;
constexpr std::size_t REVISION_LENGTH = 4;

// Alike for the two functions of one physical port, which see the same SFP.
std::string serial_number(const Port_Place& place)
{
    return "KS" + six_digits(place.adapter) + "P" + std::to_string(place.index);
}

} // namespace

std::optional<Optics> take_optics(const Json_Text& source, Json::Value& port, const Port_Place& place)
{
    Json::Value written = take_part(port, "optics");
    if (written.isNull())
        return std::nullopt;
    check_members(source, written, optics_members, "optics");
    set_default(written, "transceiver", place.converged ? "10G_BASE-SR" : "8G_SW");
    set_default(written, "speed", place.converged ? "10G" : "2G,4G,8G");
    set_default(written, "serialNo", serial_number(place));
    fill_defaults(written, optics_members);
    for (const char* name : {"vendorName", "vendorPart", "serialNo"})
        pad_text(written, name, NAME_LENGTH);
    pad_text(written, "revision", REVISION_LENGTH);
    Optics optics;
    const Json::Value readings = take_part(written, "readings");
    if (!readings.isNull()) {
        check_members(source, readings, optics_reading_members, "readings");
        optics.readings = answered_members(readings, optics_reading_members);
    }
    optics.identity = answered_members(std::move(written), optics_members);
    return optics;
}

} // namespace KPRV::simulator
