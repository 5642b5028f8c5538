#pragma once

#include "module/providers/deliver.h"

namespace KPRV {

/// The first port of the list with that place on its adapter; null if there is none.
template <class Port>
const Port* port_with_number(const List<Port>& ports, uint32 number)
{
    for (uint32 i = 0; i < ports.size(); i++) {
        if (ports[i]->PortNumber.value == number)
            return ports[i];
    }
    return nullptr;
}

} // namespace KPRV
