#include "tests/simulator/Simulator_Fixture.h"
#include "tests/support/Temp_Folder.h"

namespace KPRV::simulator {
namespace {

class Flash_Answers_test : public Simulator_Fixture
{
protected:
    Flash_Answers_test() { simulator.load_file(inventory("demo.json")); }

    Json::Value update(const std::string& file, const char* address = "20:00:02:4b:4c:10:00:00")
    {
        Json::Value request;
        request["indexStr"] = address;
        request["file"] = file;
        return call("adapterUpdateFlash", request);
    }
    /// Updates from an image with this text.
    Json::Value update_with(const std::string& text)
    {
        folder.write("fw.bin", text);
        return update(folder.path("fw.bin"));
    }
    std::string version(const char* request = "{'wwn': '20:00:02:4b:4c:10:00:00'}")
    {
        return call("getHbaByWwn", request)["firmware"]["version"].asString();
    }

    Temp_Folder folder;
};

const char* const DONE = "{'status': 0, 'message': 'Flash update successful'}";

TEST_F(Flash_Answers_test, TheVersionThatAnImageNamesIsReadBack)
{
    EXPECT_EQ(update_with("firmware-version=3.2.2.0\n"), json(DONE));
    EXPECT_EQ(version(), "3.2.2.0");
    EXPECT_EQ(version("{'mac': '02:4b:4c:20:00:00'}"), "3.2.1.0") << "the other adapters stay as they are";
    EXPECT_EQ(update_with("binary\n\x01\nfirmware-version=4.0-rc1\r\nmore"), json(DONE));
    EXPECT_EQ(version(), "4.0-rc1");
}

TEST_F(Flash_Answers_test, AnImageThatNamesNoneLeavesTheVersion)
{
    for (const char* text : {"x", "firmware-version=\n", "firmware-version=a b\n", " firmware-version=9\n",
                             "my-firmware-version=9\n"}) {
        EXPECT_EQ(update_with(text), json(DONE)) << text;
        EXPECT_EQ(version(), "3.2.1.0") << text;
    }
    update_with(std::string(5000, '\n') + "firmware-version=9\n");
    EXPECT_EQ(version(), "3.2.1.0");
}

TEST_F(Flash_Answers_test, WhatIsNoImageIsRefusedWithAStatus)
{
    EXPECT_EQ(update_with("")["status"].asUInt(), 2u);
    Json::Value answer = update(folder.path("none.bin"));
    EXPECT_EQ(answer["status"].asUInt(), 1u);
    EXPECT_EQ(answer["message"].asString(),
              "cannot read " + folder.path("none.bin") + ": No such file or directory");
    answer = update(folder.path());
    EXPECT_EQ(answer["status"].asUInt(), 1u);
    EXPECT_EQ(answer["message"].asString(), "cannot read " + folder.path() + ": not a regular file");
}

TEST_F(Flash_Answers_test, NothingIsWrittenWhereNobodyIs)
{
    folder.write("fw.bin", "firmware-version=9\n");
    EXPECT_EQ(error_code(update(folder.path("fw.bin"), "20:00:02:4b:4c:99:00:00")), 2);
    EXPECT_EQ(error_code(update(folder.path("fw.bin"), "2000024b4c100000")), 2);
    EXPECT_EQ(error_code(call("adapterUpdateFlash", "{'indexStr': '20:00:02:4b:4c:10:00:00'}")), 1);
    EXPECT_EQ(error_code(call("adapterUpdateFlash", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'file': 1}")),
              1);
    EXPECT_EQ(version(), "3.2.1.0");
}

TEST_F(Flash_Answers_test, AnAdapterCanBeOneThatFails)
{
    simulator.load_text(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"},
                                          "flashUpdate": {"status": 7, "message": "Flash is locked"},
                                          "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00"}]}]})");
    EXPECT_EQ(update_with("firmware-version=9\n"), json("{'status': 7, 'message': 'Flash is locked'}"));
    EXPECT_EQ(version(), "3.2.1.0");
    EXPECT_EQ(update_with("")["status"].asUInt(), 2u) << "the image is looked at first";
}

} // namespace
} // namespace KPRV::simulator
