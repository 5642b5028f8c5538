#pragma once

#include "contracts/cmpi/cmpimacs.h"

#include <string>

/// A provider library for the tests of the host, as a stranger would write one: it knows CMPI and nothing of
/// us.
namespace toy {

inline constexpr CMPIStatus ok = {CMPI_RC_OK, nullptr};
inline CMPIStatus failed(CMPIrc rc)
{
    return {rc, nullptr};
}

/// Set by the factory.
extern const CMPIBroker* broker;

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
