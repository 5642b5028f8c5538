#pragma once

#include "broker/Local_Server.h"
#include "broker/values/Value_Text.h"

#include <map>
#include <string>
#include <vector>

namespace KPRV {

/// Answers of several classes, one text an instance.
using Picture = std::map<std::string, std::vector<std::string>>;

/// An instance as MOF, without the lines that differ from one moment to the next: what tells a time.
inline std::string lasting_text(const broker::Instance_Value& instance)
{
    std::string kept;
    const std::string text = broker::mof_instance(instance);
    for (std::size_t at = 0, end; at < text.size(); at = end + 1) {
        end = text.find('\n', at);
        const std::string line = text.substr(at, end - at);
        if (line.find("Time") == std::string::npos)
            kept += line + "\n";
    }
    return kept;
}

inline std::vector<std::string> lasting_texts(const broker::Result& result)
{
    std::vector<std::string> all;
    for (const broker::Instance_Value& instance : result.instances)
        all.push_back(lasting_text(instance));
    return all;
}

/// The classes of a module that have instances or associations to give, but for the two that tell whether an
/// agent runs on the machine: another test may start one at any moment.
inline std::vector<std::string> enumerable_classes(broker::Local_Server& server)
{
    std::vector<std::string> names;
    for (const std::string& name : server.catalogue().class_names()) {
        const bool serves = server.providers().serves(name, broker::Mi_Kind::INSTANCE) ||
                            server.providers().serves(name, broker::Mi_Kind::ASSOCIATION);
        if (serves && name.find("_RemoteService") == std::string::npos)
            names.push_back(name);
    }
    return names;
}

} // namespace KPRV
