#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"

#include <initializer_list>

namespace KPRV {

class DiagnosticHelper;

/// Serves the adapter side and the services: adapters, ports, diagnostics, software update. It only sends a
/// class id to the helper that owns it. Failures show as an empty array, with the reason in the log.
class FCHBAManager
{
public:
    /// Made at first use, gone when the module is unloaded.
    static FCHBAManager* getFCHBAManager();

    /// All instances of the class, each fresh; the caller owns them. Read from the library at each call. A
    /// null stands for one that is not wanted.
    Array<Instance*> getInstances(classId_t id, const Wanted& wanted = {}) const;

    // Ports of one adapter, asked for without a look at the driver; the caller owns them.

    /// The FC ports of the adapter with that address.
    Array<Instance*> getFCPortInstancesByAdapter(const String& address, const Wanted& wanted = {}) const;
    /// The Ethernet ports of the adapter that the MAC belongs to.
    Array<Instance*> getEthernetPortInstancesByAdapter(const String& mac, const Wanted& wanted = {}) const;

    /// As `PortHelper::setAlarmState`.
    int setAlarmState(const String& port, int state) const;

    /// Runs the tests, see there.
    DiagnosticHelper* getDiagnosticHelper() const;

    // The diagnostic tests that an element can be put to; the caller owns them.

    /// The memory test.
    Array<Instance*> getDiagnosticServicesForAdapter() const;
    /// The loopback test, then the PCI loopback test.
    Array<Instance*> getDiagnosticServicesForFCPort() const;
    /// The Ethernet loopback test, then the PCI loopback test.
    Array<Instance*> getDiagnosticServicesForEthernetPort() const;
    /// All of them, in the order of `DiagnosticHelper::getDiagnosticServices`, without a look at the driver.
    Array<Instance*> getAllDiagnosticTestInstances() const;

private:
    FCHBAManager();

    /// The instances of several classes, one after the other.
    Array<Instance*> joined(std::initializer_list<classId_t> ids) const;
};

} // namespace KPRV
