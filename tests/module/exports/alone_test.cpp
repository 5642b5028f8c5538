#include "broker/Local_Server.h"
#include "tests/support/Log_Lines.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

/// The module on a server without the adapter library.
class Alone : public ::testing::Test
{
protected:
    void SetUp() override
    {
        _home.write(".cimplerc", "LOG_LEVEL=DBG\n");
        std::string error;
        server = broker::Local_Server::open(KLDR_MODULE, {}, error);
        ASSERT_TRUE(server) << error;
    }
    Lines said_by(const char* file) const
    {
        return told(parse_log(_home.read(".cimple/messages")),
                    [&](const Log_Line& line) { return line.file == file; });
    }

    std::unique_ptr<broker::Local_Server> server;
    Temp_Folder _home;

private:
    Environment_Override _home_override{"HOME", _home.path()};
};

TEST_F(Alone, LoadsAndTellsWhy)
{
    const Lines binding = said_by("CIMProviderZntj.cpp");
    ASSERT_EQ(3u, binding.size());
    EXPECT_EQ("DBG inside setupDLLEntryPoints", binding[0]);
    EXPECT_EQ("DBG Error in loading library: libdzntj.so: cannot open shared object file: No such file or "
              "directory",
              binding[1]);
    EXPECT_EQ("DBG Returning: setupDLLEntryPoints", binding[2]);
    EXPECT_EQ((Lines{"DBG Inside ProviderInit Constructor.", "INFO ZNTJ Library version: NOT Loaded",
                     "ERR libInitHbaLib returns NULL response or has error"}),
              said_by("ProviderInit.cpp"));
}

TEST_F(Alone, EnumeratesNothingAndFailsNobody)
{
    for (const char* name : {"KALDERA_PortController", "KALDERA_PhysicalPackage", "KALDERA_Product",
                             "KALDERA_AdapterSoftwareIdentity", "KALDERA_FCPort", "KALDERA_StorageExtent"}) {
        const broker::Result result = server->enumerate_instances(name);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << name;
        EXPECT_TRUE(result.instances.empty()) << name;
        EXPECT_EQ(1u, result.done_count) << name;
    }
    EXPECT_EQ("ERR libGetAllAdaptersIndexString returns NULL.", said_by("AdapterHelper.cpp").at(2));
    EXPECT_EQ("", server->violations().text());
}

// What the module says of itself and of the server are constants of the program.
TEST_F(Alone, TellsOfItsProfilesAllTheSame)
{
    const std::pair<const char*, size_t> counts[] = {
        {"KALDERA_RegisteredProfile", 5},
        {"KALDERA_RegisteredSubProfile", 10},
        {"KALDERA_Namespace", 1},
        {"KALDERA_ObjectManager", 1},
        {"KALDERA_CIMXMLCommunicationMechanism", 1},
        {"KALDERA_ProfileSoftwareIdentity", 1},
        {"KALDERA_AgentService", 1},
        {"KALDERA_ComputerSystem", 1},
        {"KALDERA_ElementConformsToProfile", 18},
        {"KALDERA_SubProfileRequiresProfile", 10},
        {"KALDERA_ProfileElementSoftwareIdentity", 15},
        {"KALDERA_NamespaceInManager", 1},
        {"KALDERA_CommMechanismForManager", 1},
        {"KALDERA_CommMechHostedAccessPoint", 1},
        {"KALDERA_ObjectManagerHostedService", 1},
    };
    for (const auto& [name, count] : counts) {
        const broker::Result result = server->enumerate_instances(name);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << name;
        EXPECT_EQ(count, result.instances.size()) << name;
    }
    EXPECT_EQ("", server->violations().text());
}

} // namespace
} // namespace KPRV
