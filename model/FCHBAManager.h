#pragma once

#include "adapter/classId_t.h"
#include "runtime/Array.h"
#include "runtime/Instance.h"

namespace KPRV {

/// Serves the adapter side and the services: adapters, ports, diagnostics, software update. It only sends a
/// class id to the helper that owns it. Failures show as an empty array, with the reason in the log.
class FCHBAManager
{
public:
    /// Made at first use, gone when the module is unloaded.
    static FCHBAManager* getFCHBAManager();

    /// All instances of the class, each fresh; the caller owns them. Read from the library at each call.
    Array<Instance*> getInstances(classId_t id) const;

    // The diagnostic tests that an element can be put to; the caller owns them.

    /// The memory test.
    Array<Instance*> getDiagnosticServicesForAdapter() const;
    /// The loopback test, then the PCI loopback test.
    Array<Instance*> getDiagnosticServicesForFCPort() const;
    /// The Ethernet loopback test, then the PCI loopback test.
    Array<Instance*> getDiagnosticServicesForEthernetPort() const;

private:
    FCHBAManager();
};

} // namespace KPRV
