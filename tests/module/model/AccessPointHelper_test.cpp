#include "module/model/AccessPointHelper.h"

#include "tests/module/model/Taken_Instances.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"
#include "tests/support/Named_Process.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

struct Access_Point : testing::Test
{
    const AccessPointHelper* helper = AccessPointHelper::getAccessPointHelperInstance();
    Fixed_Host host;
    Log_Capture log;

    std::vector<Set_Properties> points(classId_t id = REMOTESERVICEACCESSPOINT)
    {
        log.clear();
        return taken(helper->getInstancesByClass(id));
    }
    Lines said_by_helper() const
    {
        return told(log.lines(), [](const Log_Line& line) { return line.file == "AccessPointHelper.cpp"; });
    }
};

} // namespace

TEST_F(Access_Point, ComesAndGoesWithTheAgent)
{
    EXPECT_TRUE(points().empty());
    EXPECT_EQ(
        said_by_helper(),
        (Lines{"DBG Entering: getInstancesByClass", "DBG Entering: getRemoteServiceAccessPointInstance",
               "WARN The QXM Agent is not running so no service available",
               "DBG Returning: getRemoteServiceAccessPointInstance", "DBG Returning: getInstancesByClass"}));
    {
        const Named_Process agent("qxmagent");
        EXPECT_EQ(points(), (std::vector<Set_Properties>{{
                                {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                {"CreationClassName", "KALDERA_RemoteServiceAccessPoint"},
                                {"SystemName", "10.0.0.1"},
                                {"Name", "QXM Service"},
                                {"ElementName", "Quintex Manager Service Access Point"},
                                {"AccessInfo", "https://10.0.0.1:34568/index.html"},
                                {"InfoFormat", "200"},
                                // Defaults of the schema.
                                {"AccessContext", "0"},
                                {"EnabledState", "5"},
                                {"RequestedState", "12"},
                                {"EnabledDefault", "2"},
                                {"TransitioningToState", "12"},
                            }}));
        EXPECT_EQ(
            said_by_helper(),
            (Lines{"DBG Entering: getInstancesByClass", "DBG Entering: getRemoteServiceAccessPointInstance",
                   "DBG Returning: getRemoteServiceAccessPointInstance", "INFO Number of instances: 1",
                   "DBG Returning: getInstancesByClass"}));
    }
    EXPECT_TRUE(points().empty());
}

TEST_F(Access_Point, AnyNameThatEndsSoWillDo)
{
    const Named_Process agent("my_qxmagent");
    EXPECT_EQ(points().size(), 1u);
    // The class is not asked.
    EXPECT_EQ(points(FCPORT).size(), 1u);
}

TEST_F(Access_Point, AHostWithoutANameHasNoneEvenWithAnAgent)
{
    const Named_Process agent("qxmagent");
    host_calls.gethostname = [](char*, size_t) { return -1; };
    EXPECT_TRUE(points().empty());
    EXPECT_EQ(said_by_helper(),
              (Lines{"DBG Entering: getInstancesByClass", "WARN getHostInfo returned localhost",
                     "DBG Returning: getInstancesByClass"}));
}

TEST_F(Access_Point, ANameTakesThePlaceOfAMissingAddress)
{
    const Named_Process agent("qxmagent");
    host_calls.gethostbyname_r = find_no_host;
    EXPECT_EQ(points().at(0).at("AccessInfo"), "https://h:34568/index.html");
    EXPECT_EQ(log.said("WARN"), Lines{});
}
