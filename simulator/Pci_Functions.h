#pragma once

#include "simulator/Inventory.h"

namespace KPRV::simulator {

/// A function that the adapter shows on the PCI bus: a port's own, or a virtual NIC.
struct Pci_Function
{
    unsigned index;
    const char* type; // "FC", "FCoE" or "Ethernet"
    unsigned physical_port;
    std::string address;
    const Virtual_Nic* vnic; // null for a port's own function
};

/// The functions of an adapter: those of its ports, which come first and stay, then virtual NICs.
std::vector<Pci_Function> pci_functions(const Adapter& adapter);

/// The lowest index that no function of the adapter has.
unsigned free_function(const Adapter& adapter);

} // namespace KPRV::simulator
