#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

// Object paths, as text, of what an alert can be about: "//HOST/root/kaldera:Class.Key=...". An id stands in
// them as it is given.

String getFCPortObjectPath(const String& port_id);
String getEthernetPortObjectPath(const String& port_id);
String getComputerSystemObjectPath();
/// No event is about the agent service yet.
String getAgentServiceObjectPath();

/// Name of the host as alerts and paths give it.
String host_name_of_alerts();

} // namespace KPRV
