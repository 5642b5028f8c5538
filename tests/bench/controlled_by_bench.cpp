#include "tests/bench/requests.h"

namespace KPRV::bench {

void add_controlled_by(bool tiny)
{
    constexpr const char* ASSOCIATION = "KALDERA_ControlledBy";
    for (const unsigned adapters : {1u, 8u, 64u}) {
        if (tiny && adapters > 1)
            break;
        const Storage_Size size = {.adapters = adapters, .ports = 2};
        const std::string behind = "/" + std::to_string(adapters) + "x" + std::to_string(size.ports);
        for (const Twins& twins :
             {enumeration("B7 enumerate adapters with their ports" + behind, ASSOCIATION, size,
                          plain_enumerate_controlled_by),
              associator_names("B7 names of the last adapter's ports" + behind, ASSOCIATION,
                               "KALDERA_PortController", last_adapter(size), size, plain_names_of_ports)}) {
            check_equal(twins);
            add(twins);
        }
    }
}

} // namespace KPRV::bench
