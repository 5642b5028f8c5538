#include "tests/simulator/Agent_Fixture.h"

namespace KPRV::simulator {
namespace {

class Path_Record_Answers_test : public Agent_Fixture
{
protected:
    static std::string lun(int number, const std::string& more = "")
    {
        return "{'rPortWwn': '50:24:b4:c0:00:40:00:01', 'lunId': '" + std::to_string(number) + "'" + more +
               "}";
    }

    static std::string masks(const std::string& added, const std::string& removed = "null",
                             const std::string& clear = "false")
    {
        return std::string("{'indexStr': '") + fc_port + "', 'addedLunMaskData': " + added +
               ", 'removedLunMaskData': " + removed + ", 'clearLunMaskData': " + clear + "}";
    }

    static std::string profiles(const std::string& added, const std::string& removed = "[]")
    {
        return std::string("{'indexStr': '") + fc_port + "', 'addedAdvancedIoProfiles': " + added +
               ", 'removedAdvancedIoProfiles': " + removed + "}";
    }

    std::string at_port(const std::string& more = "")
    {
        return std::string("{'indexStr': '") + fc_port + "'" + more + "}";
    }

    Json::Value masked() { return call("getLunMaskData", at_port().c_str())["lunMaskData"]; }
    Json::Value profiled() { return call("getAdvIoProfile", at_port().c_str())["advancedIoProfiles"]; }
};

TEST_F(Path_Record_Answers_test, MasksAreKeptInTheOrderOfTheirMaking)
{
    EXPECT_EQ(masked(), json("[]"));
    done("setLunMaskData", masks("[" + lun(2) + ", " + lun(0, ", 'note': 'boot'") + "]"));
    EXPECT_EQ(masked(), json("[" + lun(2) + ", " + lun(0, ", 'note': 'boot'") + "]"));
    done("setLunMaskData", masks("[" + lun(1) + "]", "[" + lun(2) + "]"));
    EXPECT_EQ(masked(), json("[" + lun(0, ", 'note': 'boot'") + ", " + lun(1) + "]"));
    done("setLunMaskData", masks("null", "null", "true"));
    EXPECT_EQ(masked(), json("[]"));
}

TEST_F(Path_Record_Answers_test, AChangeOfMasksIsMadeAsAWholeOrNotAtAll)
{
    done("setLunMaskData", masks("[" + lun(0) + "]"));
    EXPECT_EQ(refused("setLunMaskData", masks("[" + lun(1) + ", " + lun(0) + "]")), DUPLICATE);
    EXPECT_EQ(refused("setLunMaskData", masks("[" + lun(1) + ", " + lun(1) + "]")), DUPLICATE);
    EXPECT_EQ(refused("setLunMaskData", masks("[]", "[" + lun(0) + ", " + lun(1) + "]")), NOT_FOUND);
    EXPECT_EQ(refused("setLunMaskData", masks("[]", "[" + lun(0) + "]", "true")), NOT_FOUND);
    EXPECT_EQ(refused("setLunMaskData", masks("[" + lun(7) + "]")), ADDRESS);
    EXPECT_EQ(refused("setLunMaskData", masks("[{'rPortWwn': 'nowhere', 'lunId': '1'}]")), ADDRESS);
    EXPECT_EQ(refused("setLunMaskData", masks("[{'rPortWwn': '50:24:b4:c0:00:40:00:01'}]")), REQUEST);
    EXPECT_EQ(refused("setLunMaskData", masks("[{'lunId': '1'}]")), ADDRESS);
    EXPECT_EQ(refused("setLunMaskData", masks("[7]")), REQUEST);
    EXPECT_EQ(refused("setLunMaskData", masks("7")), REQUEST);
    EXPECT_EQ(refused("setLunMaskData", masks("[]", "[]", "null")), REQUEST);
    EXPECT_EQ(refused("getLunMaskData", "{'indexStr': '02:4b:4c:20:00:00'}"), ADDRESS);
    EXPECT_EQ(masked(), json("[" + lun(0) + "]"));
}

TEST_F(Path_Record_Answers_test, ARecordSaysItselfWhatItIsAboutAndNothingElseDoes)
{
    // A record cannot lead to another port than the one that it is set for.
    done("setLunMaskData", masks("[" + lun(0, ", 'wwn': '10:00:02:4b:4c:10:00:01'") + "]"));
    EXPECT_EQ(refused("setLunMaskData", masks("[" + lun(0, ", 'indexStr': '10:00:02:4b:4c:30:00:00'") + "]")),
              DUPLICATE);
    EXPECT_EQ(refused("setLunMaskData", masks("[" + lun(0, ", 'lPortWwn': '10:00:02:4B:4C:10:00:00'") + "]")),
              DUPLICATE);
}

TEST_F(Path_Record_Answers_test, AProfileTakesThePlaceOfTheOneBefore)
{
    EXPECT_EQ(profiled(), json("[]"));
    done("setAdvIoProfile", profiles("[" + lun(0, ", 'threshold': 1") + "]"));
    done("setAdvIoProfile", profiles("[" + lun(0, ", 'threshold': 2") + "]"));
    EXPECT_EQ(profiled(), json("[" + lun(0, ", 'threshold': 2") + "]"));
    done("setAdvIoProfile",
         std::string("{'indexStr': '") + fc_port + "', 'removedAdvancedIoProfiles': [" + lun(0) + "]}");
    EXPECT_EQ(profiled(), json("[]"));
    EXPECT_EQ(refused("setAdvIoProfile", profiles("[]", "[" + lun(0) + "]")), NOT_FOUND);
    EXPECT_EQ(refused("setAdvIoProfile", profiles("{}", "[]")), REQUEST);
    EXPECT_EQ(refused("setAdvIoProfile", at_port()), REQUEST);
}

TEST_F(Path_Record_Answers_test, ProfilesAreClearedWithWhatLiesBelow)
{
    const std::string behind = ", 'lPortWwn': '10:00:02:4b:4c:10:00:00'";
    const std::string array = behind + ", 'rPortWwn': '50:24:b4:c0:00:40:00:01'";
    const std::string everything =
        "[{'note': 'port'}, " + lun(0) + ", " + lun(1) + ", {'rPortWwn': '50:24:b4:c0:00:50:00:01'}]";
    const std::pair<std::string, unsigned> levels[] = {
        {array + ", 'lunId': '1'", 3}, {array, 2}, {behind, 1}, {"", 0}};
    for (const auto& [level, left] : levels) {
        simulator.load_file(inventory("demo.json"));
        done("setAdvIoProfile", profiles(everything));
        EXPECT_EQ(profiled().size(), 4u);
        done("clearAdvIoProfile", at_port(level));
        EXPECT_EQ(profiled().size(), left) << level;
    }
    EXPECT_EQ(refused("clearAdvIoProfile", at_port(array + ", 'lunId': '9'")), ADDRESS);
    EXPECT_EQ(refused("clearAdvIoProfile", at_port(", 'lPortWwn': 'nowhere'")), ADDRESS);
}

TEST_F(Path_Record_Answers_test, AVirtualPortTakesItsRecordsWithIt)
{
    done("createVport", new_vport());
    const std::string of_vport = "[" + lun(0, ", 'lPortWwn': '10:01:02:4b:4c:10:00:00'") + "]";
    done("setLunMaskData", masks(of_vport));
    done("setAdvIoProfile", profiles(of_vport));
    done("setLunMaskData", masks("[" + lun(0) + "]"));
    done("deleteVport", vports("['10:01:02:4b:4c:10:00:00']"));
    EXPECT_EQ(masked(), json("[" + lun(0) + "]"));
    EXPECT_EQ(profiled(), json("[]"));
}

} // namespace
} // namespace KPRV::simulator
