#include "kldrcim/walks/Host_Readings.h"

#include "kldrcim/walks/Address_Text.h"
#include "kldrcim/walks/Property_Values.h"

#include <chrono>

namespace KPRV::kldrcim {

Host_Readings read_host(Connection& connection)
{
    using Clock = std::chrono::steady_clock;
    const Clock::time_point begin = Clock::now();
    Association_Index index(connection);
    Host_Readings readings;
    readings.host = read_host_facts(index, {.units = true});
    Optics_Reader optics(connection);
    for (Adapter_Facts& adapter : readings.host.adapters)
        for (Port_Facts& port : adapter.ports)
            if (!port.is_ethernet)
                port.optics = optics.read(colon_form(text_of(port.port, "DeviceID")));
    for (const Instance_Value& software : index.instances("KALDERA_ProfileSoftwareIdentity"))
        readings.module_versions.push_back(text_of(software, "VersionString"));
    readings.failures = index.failures();
    readings.seconds = std::chrono::duration<double>(Clock::now() - begin).count();
    return readings;
}

} // namespace KPRV::kldrcim
