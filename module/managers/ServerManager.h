#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"

namespace KPRV {

/// The version of the build, four numbers between points: what the module says of itself as software.
extern const char* const prov_build_version;

/// Describes the server side of the module: its profiles, the object manager, the namespace and the services.
/// Nothing here depends on adapters or the driver, and nothing is kept. Instances belong to the caller; what
/// the builders do not set has the default of the schema.
class ServerManager
{
public:
    /// Made at first use, gone when the module is unloaded.
    static ServerManager* getServerManager();

    /// As `FCHBAManager::getInstances`.
    Array<Instance*> getInstances(classId_t id) const;

    // Profiles: constants, see `Registered_Profiles.h`.

    Array<Instance*> getRegisteredProfileInstances() const;
    Array<Instance*> getRegisteredSubProfileInstances() const;
    /// Short names of the subprofiles of a profile, by its short name.
    Array<String> getSubProfilesOfProfile(const String& profile) const;

    // One instance each.

    /// Named as the hosting server names its own object manager, which is asked for it each time: "CIM
    /// Server" if the server refuses, null if it has none.
    Array<Instance*> getObjectManagerInstance() const;
    /// "root/kaldera". Its `ObjectManagerName` is the `Name` of the object manager.
    Array<Instance*> getNamespaceInstances() const;
    Array<Instance*> getCIMXMLCommunicationMechanismInstance() const;
    /// The module itself, as the software that implements the profiles.
    Array<Instance*> getProfileSoftwareIdentityInstances() const;
    /// What carries the protocol of the management application.
    Array<Instance*> getAgentServiceInstances() const;

private:
    ServerManager() = default;
};

} // namespace KPRV
