#pragma once

#include "module/runtime/system/Standard_Mutex.h"

#include <cstddef>
#include <string>
#include <vector>

namespace KPRV::broker {

/// Breaches of the CMPI contract by a provider, in the order in which they were seen. Safe for any thread.
class Violations
{
public:
    /// `call` is the CMPI call in which it was seen, for example "CMSetProperty".
    void add(const char* call, const std::string& what);

    /// "CMSetProperty: what", one text per breach.
    std::vector<std::string> list() const;
    std::size_t count() const;
    bool empty() const { return count() == 0; }
    void clear();

    /// All of them, one a line: what a failing test prints.
    std::string text() const;

private:
    mutable Standard_Mutex<> _mutex;
    std::vector<std::string> _list GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
