#pragma once

#include "simulator/Target.h"

namespace KPRV::simulator {

/// What can be read of an adapter or a port in one piece, as an index of the table.
enum class Setting
{
    ADVANCED_ADAPTER,
    ADVANCED_PORT,
    BOOT_OVER_SAN,
    FC,
    FCOE,
    AUTHENTICATION,
    CEE,
    LLDP,
};

struct Setting_Row
{
    const char* name;
    Scope scope;
    const char* fallback; // JSON text
    /// Adds what the inventory knows of the target, in place of the fallback. Null if that is nothing.
    void (*derive)(Inventory& inventory, const Target& target, Json::Value& answer);
};

const Setting_Row& setting_row(Setting setting);

/// Throws Refused unless each member of `written` bears the name of a setting and is an object.
void check_settings(const Json_Text& source, const Json::Value& written);

/// The whole of a setting: what was set, then what the inventory knows, then the fallback.
Json::Value setting_of(Inventory& inventory, Setting setting, const Target& target);

/// What was set, to be changed.
Json::Value& kept_setting(Setting setting, const Target& target);

/// Why these members cannot be set, in words; empty if they can. `names` lists what is to be taken from
/// `values`; only a member that `present` has can be set, to a value of its kind.
std::string setting_objection(const Json::Value& names, const Json::Value& values,
                              const Json::Value& present);

} // namespace KPRV::simulator
