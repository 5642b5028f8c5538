#pragma once

#include "contracts/cmpi/cmpimacs.h"

#include <atomic>
#include <string>

/// A provider library for the tests of the server, as a stranger would write one: it knows CMPI and nothing
/// of us.
namespace toy {

inline constexpr CMPIStatus ok = {CMPI_RC_OK, nullptr};
inline CMPIStatus failed(CMPIrc rc)
{
    return {rc, nullptr};
}

/// The broker that the factories were given, each anew, while other threads use it.
class Broker_Slot
{
public:
    void operator=(const CMPIBroker* broker) { _broker = broker; }
    operator const CMPIBroker*() const { return _broker; }
    const CMPIBroker* operator->() const { return _broker; }

private:
    std::atomic<const CMPIBroker*> _broker = nullptr;
};

extern Broker_Slot broker;

/// What the method entry was called with.
struct Call
{
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const CMPIArgs* in;
    CMPIArgs* out;

    /// An in argument as text; empty if it is absent.
    std::string text(const char* name) const;
    /// Returns a number, and the end.
    CMPIStatus answer(CMPIUint32 number) const;
};

struct Method
{
    const char* name;
    CMPIStatus (*run)(const Call&);
};

/// Well-behaved methods, and those that break the contract; both end with a null name.
extern const Method methods[];
extern const Method misdeeds[];

} // namespace toy

#define TOY_EXPORT extern "C" __attribute__((visibility("default")))
