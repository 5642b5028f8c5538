#include "module/update/SoftwareUpdateHelper.h"

#include "module/adapter/Json_Access.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"
#include "tests/module/model/Taken_Instances.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

struct Software_Update : testing::Test
{
    Fixed_Host host;
    Fake_Library library;
    const SoftwareUpdateHelper* helper = SoftwareUpdateHelper::getSoftwareUpdateHelperInstance();
    Log_Capture log;

    std::vector<Set_Properties> published(classId_t id) { return taken(helper->getInstancesByClass(id)); }

    uint32 update(const char* device_id = "2000024b4c100000", const char* file = "/fw/a.bin")
    {
        const Ref<KALDERA_PortController> controller(create_null<KALDERA_PortController>());
        controller->DeviceID.set(device_id);
        controller->ControllerType.set(4);
        log.clear();
        return helper->UpdatePortControllerSoftware(controller.ptr(), file);
    }
    uint32 update_answered(const char* answer)
    {
        library.answers("adapterUpdateFlash", json(answer));
        return update();
    }
};

constexpr const char* SAYS =
    "DBG UpdatePortControllerSoftware portType=4 deviceid=2000024b4c100000 file=/fw/a.bin";

} // namespace

TEST_F(Software_Update, IsOneObject)
{
    EXPECT_EQ(helper, SoftwareUpdateHelper::getSoftwareUpdateHelperInstance());
}

TEST_F(Software_Update, TheService)
{
    EXPECT_EQ((std::vector<Set_Properties>{{
                  {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                  {"SystemName", "10.0.0.1"},
                  {"CreationClassName", "KALDERA_HBASoftwareInstallationService"},
                  {"Name", "Kaldera Adapter Software Update Service"},
              }}),
              published(HBASOFTWAREINSTALLATIONSERVICE));
    EXPECT_EQ(Lines{"INFO Number of instances: 1"}, log.said());
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Software_Update, ItsCapabilities)
{
    EXPECT_EQ((std::vector<Set_Properties>{{
                  {"InstanceID", "Kaldera Adapter Software Update Service"},
                  {"SupportedSynchronousActions", "{5}"},
                  {"SupportedInstallOptions", "{4, 5}"},
                  {"SupportedURISchemes", "{3, 8}"},
              }}),
              published(HBASOFTWAREINSTALLATIONSERVICECAPABILITIES));
    EXPECT_EQ(Lines{"INFO Number of instances: 1"}, log.said());
}

TEST_F(Software_Update, NothingElse)
{
    EXPECT_TRUE(published(PORTCONTROLLER).empty());
    EXPECT_EQ((Lines{"INFO Default case . Other classes ", "INFO Number of instances: 0"}), log.said());
}

TEST_F(Software_Update, HandsAddressAndFileToTheLibrary)
{
    EXPECT_EQ(0u, update_answered("{'status': 0, 'message': 'done'}"));
    EXPECT_EQ(Lines{R"(adapterUpdateFlash {"file":"/fw/a.bin","indexStr":"20:00:02:4b:4c:10:00:00"})"},
              library.told());
    EXPECT_EQ((Lines{SAYS, "DBG status=0 message = done"}), log.said());
    EXPECT_EQ(
        (Lines{"DBG Entering: UpdatePortControllerSoftware", "DBG Returning: UpdatePortControllerSoftware"}),
        log.traces());

    update("00024b4c2000", "fw");
    EXPECT_EQ(R"(adapterUpdateFlash {"file":"fw","indexStr":"00:02:4b:4c:20:00"})", library.told().back());
}

TEST_F(Software_Update, GivesTheLibrarySStatus)
{
    EXPECT_EQ(7u, update_answered("{'status': 7, 'message': 'locked'}"));
    EXPECT_EQ((Lines{SAYS, "DBG status=7 message = locked"}), log.said());
    EXPECT_EQ(4294967295u, update_answered("{'status': 4294967295, 'message': ''}"));
    EXPECT_EQ((Lines{SAYS, "DBG status=-1 message = "}), log.said());
    // Null is a number and a text of its own.
    EXPECT_EQ(0u, update_answered("{'status': null, 'message': null}"));
}

TEST_F(Software_Update, AnAnswerWithoutOneOfTheTwoIsAFailure)
{
    for (const char* answer : {"null", "{}", "{'status': 0}", "{'message': 'done'}", "[0]", "0",
                               "{'status': 0, 'message': 'done', 'error': null}",
                               "{'error': {'code': 2, 'message': 'no such address'}}"}) {
        EXPECT_EQ(SoftwareUpdateHelper::NO_STATUS, update_answered(answer)) << answer;
        EXPECT_EQ((Lines{SAYS, "ERR libAdapterUpdateFlash is failed."}), log.said()) << answer;
    }
}

TEST_F(Software_Update, MembersOfTheWrongTypeThrow)
{
    EXPECT_THROW(update_answered("{'status': 'good', 'message': 'done'}"), Not_Convertible);
    EXPECT_THROW(update_answered("{'status': -1, 'message': 'done'}"), Not_Convertible);
    EXPECT_THROW(update_answered("{'status': 0, 'message': 1}"), Not_Convertible);
}

TEST_F(Software_Update, TheLibrarySExceptionsPass)
{
    library.throws("adapterUpdateFlash", HbaAgentError{7, "busy"});
    EXPECT_THROW(update(), HbaAgentError);
    library.throws("adapterUpdateFlash", 5);
    EXPECT_THROW(update(), int);
}
