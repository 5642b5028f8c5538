#pragma once

#include "contracts/cmpi/cmpidt.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <atomic>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace KPRV::broker {

/// Sees every CMPI call of a provider, under the name of its convenience call ("CMNewInstance",
/// "CMSetProperty", "CBGetInstance"). Records them in order, and makes chosen ones fail. Safe for any thread.
class Call_Log
{
public:
    /// Recording is off at first: it costs time.
    void record(bool on) { _recording = on; }

    /// "CMSetProperty Name": the call and its key argument (class, property, key, argument, method, text or
    /// kind).
    std::vector<std::string> calls() const;
    /// Those of the recorded calls whose name is given, arguments included.
    std::vector<std::string> calls(std::string_view name) const;
    void clear();

    /// The n-th call of that name from now on, counted from 1, answers `rc` and no result.
    void fail(const std::string& call, unsigned nth, CMPIrc rc);
    /// The n-th call of that name from now on throws `std::runtime_error`, as servers in C++ may do.
    void throw_at(const std::string& call, unsigned nth);
    /// Forgets all that was asked of `fail` and `throw_at`.
    void mend();

    /// The gate that each call passes. The code with which it must fail, or 0.
    CMPIrc enter(const char* call, std::string_view argument);

private:
    struct Fault
    {
        unsigned countdown;
        CMPIrc rc;
        bool throws;
    };

    std::atomic<bool> _recording = false;
    std::atomic<bool> _faulty = false;
    mutable Standard_Mutex<> _mutex;
    std::vector<std::string> _calls GUARDED_BY(_mutex);
    std::multimap<std::string, Fault, std::less<>> _faults GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
