#include "module/model/Registered_Profiles.h"

#include "tests/module/model/Taken_Instances.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

Set_Properties profile(const char* name, const char* title, const char* description, const char* organization,
                       const char* version)
{
    return {
        {"InstanceID", name},
        {"RegisteredName", name},
        {"Caption", title},
        {"ElementName", title},
        {"Description", description},
        {"RegisteredOrganization", organization},
        {"RegisteredVersion", version},
        {"AdvertiseTypes", "{3}"},
    };
}

Lines subprofiles(const char* name)
{
    Lines result;
    for (const String& subprofile : subprofiles_of(name))
        result.push_back(subprofile.c_str());
    return result;
}

} // namespace

// clang-format off
TEST(Registered_Profiles, FiveProfiles)
{
    EXPECT_EQ(taken(registered_profiles()), (std::vector<Set_Properties>{
        profile("SMI-S", "SMI-S", "This instance models the SMI-S standard as such", "11", "1.2.0"),
        profile("FC HBA", "FC HBA Profile", "The FC HBA Profile models the HBA device", "11", "1.2.0"),
        profile("Server", "Server Profile", "The Server Profile models the CIM Server", "11", "1.2.0"),
        profile("Host Discovered Resources", "Host Discovered Resources Profile", "The HDR profile models the discovered storage resources", "11", "1.2.0"),
        profile("Storage HBA", "Storage HBA Profile", "The Storage HBA Profile models the manageable elements of an HBA", "11", "1.3.0"),
    }));
}

TEST(Registered_Profiles, TenSubprofiles)
{
    EXPECT_EQ(taken(registered_subprofiles()), (std::vector<Set_Properties>{
        profile("FC Initiator Ports", "FC Initiator Ports subprofile", "The FC Initiator Ports subprofile models the ports present in the HBA device", "11", "1.2.0"),
        profile("Profile Registration", "Profile Registration Profile", "The Profile Registration Profile models the profiles registered in the object manager.", "11", "1.0.0"),
        profile("Access Points", "Access Points subprofile", "This models the management service(s) points available to the user.", "11", "1.2.0"),
        profile("Software Update", "Software Update profile", "This models the software installation service available to the user.", "2", "1.0.0"),
        profile("Software Inventory", "Software Inventory profile", "This models the softwares installed and available for installation on the system.", "2", "1.0.0"),
        profile("Physical Asset", "Physical Asset profile", "This models the physical aspects of the adapter hardware.", "2", "1.0.2"),
        profile("Ethernet Port", "Ethernet Port profile", "This models the ethernet characteristics of the port present in the adapter.", "2", "1.0.0"),
        profile("Diagnostics Profile", "Diagnostics Profile", "This models the diagnostic services available for the adapters and its ports.", "2", "2.0.0"),
        profile("Host LAN Network Port", "Host LAN Network Port Profile", "This models the network interfaces associated with the network ports", "2", "1.0.0"),
        profile("FCoE Initiator Ports", "FCoE Initiator Ports Profile", "This models the FCoE functionality of CNAs", "11", "1.0.0"),
    }));
}
// clang-format on

TEST(Registered_Profiles, SubprofilesOfAProfileInAnyCase)
{
    const Lines of_fc_hba = {"FC Initiator Ports",  "Software Update",      "Software Inventory",
                             "Access Points",       "Physical Asset",       "Ethernet Port",
                             "Diagnostics Profile", "Host LAN Network Port"};
    EXPECT_EQ(subprofiles("FC HBA"), of_fc_hba);
    EXPECT_EQ(subprofiles("fc hba"), of_fc_hba);
    EXPECT_EQ(subprofiles("Server"), Lines{"Profile Registration"});
    EXPECT_EQ(subprofiles("STORAGE HBA"), Lines{"FCoE Initiator Ports"});
    for (const char* none : {"Host Discovered Resources", "SMI-S", "FC HBA Profile", "FC", ""})
        EXPECT_EQ(subprofiles(none), Lines{}) << none;
}

TEST(Registered_Profiles, EachSubprofileHasOneParent)
{
    std::map<std::string, int> parents;
    for (const std::string& profile : taken(registered_profiles(), "InstanceID")) {
        for (const std::string& subprofile : subprofiles(profile.c_str()))
            parents[subprofile]++;
    }
    std::map<std::string, int> expected;
    for (const std::string& subprofile : taken(registered_subprofiles(), "InstanceID"))
        expected[subprofile] = 1;
    EXPECT_EQ(parents, expected);
}
