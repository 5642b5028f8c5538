#pragma once

#include "kldrcim/walks/Host_Facts.h"

namespace KPRV::kldrcim {

/// A host as it is now, with all that can be measured of it.
struct Host_Readings
{
    Host_Facts host;
    /// Of the provider module; one, as long as it is right.
    std::vector<std::string> module_versions;
    /// What kept some of it away.
    std::vector<Provider_Failure> failures;
    /// How long it took.
    double seconds = 0;
};

/// Reads the host anew: states, speeds, statistics, numbers of logical units, what transceivers measure.
Host_Readings read_host(Connection& connection);

} // namespace KPRV::kldrcim
