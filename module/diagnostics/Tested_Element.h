#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"

namespace KPRV {

/// What a run is about: an adapter (class id 2), an FC port (3) or an Ethernet port (20), by the flat address
/// that is its `DeviceID`. The two other addresses are empty.
struct Tested_Element
{
    classId_t class_id = NO_CLASS;
    String adapter_address;
    String port_wwn;
    String port_mac;
};

/// The element's instance as it is now; the caller owns it. Null if it has gone, or for another class id.
/// Enumerates the element's class; exceptions of `libGetAllAdaptersIndexString` pass.
Instance* find_tested_element(const Tested_Element& element);

} // namespace KPRV
