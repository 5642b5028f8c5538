#include "module/model/Registered_Profiles.h"

#include "module/model/Fresh_Instances.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"
#include "module/schema/KALDERA_RegisteredProfile.h"
#include "module/schema/KALDERA_RegisteredSubProfile.h"

#include <span>

namespace KPRV {

namespace {

/// Values of `RegisteredOrganization`.
enum Organization : uint16
{
    DMTF = 2,
    SNIA = 11,
};

struct Profile
{
    const char* name;  ///< `InstanceID` and `RegisteredName`.
    const char* title; ///< `Caption` and `ElementName`.
    const char* description;
    Organization organization;
    const char* version;
};

/// A subprofile and the profile that it belongs to, by their names.
struct Membership
{
    const char* profile;
    const char* subprofile;
};

// clang-format off
constexpr Profile profiles[] = {
//   name                         title                                description                                                          org    version
    {"SMI-S",                     "SMI-S",                             "This instance models the SMI-S standard as such",                   SNIA,  "1.2.0"},
    {"FC HBA",                    "FC HBA Profile",                    "The FC HBA Profile models the HBA device",                          SNIA,  "1.2.0"},
    {"Server",                    "Server Profile",                    "The Server Profile models the CIM Server",                          SNIA,  "1.2.0"},
    {"Host Discovered Resources", "Host Discovered Resources Profile", "The HDR profile models the discovered storage resources",           SNIA,  "1.2.0"},
    {"Storage HBA",               "Storage HBA Profile",               "The Storage HBA Profile models the manageable elements of an HBA",  SNIA,  "1.3.0"},
};

// Profiles of the DMTF stand here too, each under a profile of the SNIA.
constexpr Profile subprofiles[] = {
//   name                     title                              description                                                                                  org    version
    {"FC Initiator Ports",    "FC Initiator Ports subprofile",   "The FC Initiator Ports subprofile models the ports present in the HBA device",              SNIA,  "1.2.0"},
    {"Profile Registration",  "Profile Registration Profile",    "The Profile Registration Profile models the profiles registered in the object manager.",    SNIA,  "1.0.0"},
    {"Access Points",         "Access Points subprofile",        "This models the management service(s) points available to the user.",                       SNIA,  "1.2.0"},
    {"Software Update",       "Software Update profile",         "This models the software installation service available to the user.",                      DMTF,  "1.0.0"},
    {"Software Inventory",    "Software Inventory profile",      "This models the softwares installed and available for installation on the system.",         DMTF,  "1.0.0"},
    {"Physical Asset",        "Physical Asset profile",          "This models the physical aspects of the adapter hardware.",                                 DMTF,  "1.0.2"},
    {"Ethernet Port",         "Ethernet Port profile",           "This models the ethernet characteristics of the port present in the adapter.",              DMTF,  "1.0.0"},
    {"Diagnostics Profile",   "Diagnostics Profile",             "This models the diagnostic services available for the adapters and its ports.",             DMTF,  "2.0.0"},
    {"Host LAN Network Port", "Host LAN Network Port Profile",   "This models the network interfaces associated with the network ports",                      DMTF,  "1.0.0"},
    {"FCoE Initiator Ports",  "FCoE Initiator Ports Profile",    "This models the FCoE functionality of CNAs",                                                SNIA,  "1.0.0"},
};

// Each subprofile has one profile. The order is the one in which they are named, not that of the table above.
constexpr Membership memberships[] = {
//   profile          subprofile
    {"FC HBA",        "FC Initiator Ports"},
    {"FC HBA",        "Software Update"},
    {"FC HBA",        "Software Inventory"},
    {"FC HBA",        "Access Points"},
    {"FC HBA",        "Physical Asset"},
    {"FC HBA",        "Ethernet Port"},
    {"FC HBA",        "Diagnostics Profile"},
    {"FC HBA",        "Host LAN Network Port"},
    {"Server",        "Profile Registration"},
    {"Storage HBA",   "FCoE Initiator Ports"},
};
// clang-format on

/// `AdvertiseTypes`: found by way of the service location protocol.
constexpr uint16 ADVERTISED_BY_SLP = 3;

template <class T>
T* instance_of(const Profile& profile)
{
    Ref<T> instance(create<T>(true));
    instance->InstanceID.set(profile.name);
    instance->RegisteredName.set(profile.name);
    instance->Caption.set(profile.title);
    instance->ElementName.set(profile.title);
    instance->Description.set(profile.description);
    instance->RegisteredOrganization.set(profile.organization);
    instance->RegisteredVersion.set(profile.version);
    instance->AdvertiseTypes.set(array_of<uint16>({ADVERTISED_BY_SLP}));
    return instance.steal();
}

template <class T>
Array<Instance*> instances_of(std::span<const Profile> table)
{
    Fresh_Instances instances;
    for (const Profile& row : table)
        instances.append(instance_of<T>(row));
    return instances.release();
}

} // namespace

Array<Instance*> registered_profiles()
{
    return instances_of<KALDERA_RegisteredProfile>(profiles);
}

Array<Instance*> registered_subprofiles()
{
    return instances_of<KALDERA_RegisteredSubProfile>(subprofiles);
}

Array<String> subprofiles_of(const String& profile)
{
    Array<String> names;
    for (const Membership& row : memberships) {
        if (profile.equali(row.profile))
            names.append(row.subprofile);
    }
    return names;
}

} // namespace KPRV
