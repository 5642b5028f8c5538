#pragma once

#include "module/runtime/objects/Instance.h"

#include <map>
#include <string>
#include <vector>

namespace KPRV {

/// What the managers answer, list by list, and a note of each fetch in order. A list goes by what is asked
/// for: a class without its prefix ("FCPort"), "FC ports of <address>", "Ethernet ports of <address>",
/// "Ethernet ports of adapter <id>", "tests for adapters", "tests for FC ports", "tests for Ethernet ports",
/// "all tests". Subprofiles of a profile are no list: they are the real ones. A list without a script is
/// empty. The lists stay; each fetch gives clones.
struct Managers_Script
{
    std::map<std::string, std::vector<const Instance*>> lists;
    std::vector<std::string> fetched;

    ~Managers_Script() { clear(); }
    void clear();
};

/// One for all managers; tests clear it.
inline Managers_Script managers_script;

} // namespace KPRV
