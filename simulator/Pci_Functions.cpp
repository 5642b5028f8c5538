#include "simulator/Pci_Functions.h"

#include <algorithm>

namespace KPRV::simulator {

std::vector<Pci_Function> pci_functions(const Adapter& adapter)
{
    std::vector<Pci_Function> functions;
    const auto add_port = [&](const Port& port, std::size_t place) {
        const bool fcoe = port.data["isFCoE"].isBool() && port.data["isFCoE"].asBool();
        const char* type = port.kind == Port_Kind::ETHERNET ? "Ethernet" : fcoe ? "FCoE" : "FC";
        functions.push_back({static_cast<unsigned>(functions.size()), type, static_cast<unsigned>(place),
                             port.address, nullptr});
    };
    for (std::size_t place = 0; place < adapter.fc_ports.size(); ++place)
        add_port(adapter.fc_ports[place], place);
    for (std::size_t place = 0; place < adapter.eth_ports.size(); ++place)
        add_port(adapter.eth_ports[place], place);
    for (std::size_t place = 0; place < adapter.eth_ports.size(); ++place)
        for (const Virtual_Nic& nic : adapter.eth_ports[place].vnics)
            functions.push_back({nic.function, "Ethernet", static_cast<unsigned>(place), nic.mac, &nic});
    return functions;
}

unsigned free_function(const Adapter& adapter)
{
    const std::vector<Pci_Function> functions = pci_functions(adapter);
    for (unsigned index = 0;; ++index)
        if (std::none_of(functions.begin(), functions.end(),
                         [&](const Pci_Function& each) { return each.index == index; }))
            return index;
}

} // namespace KPRV::simulator
