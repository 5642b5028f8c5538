// `kldrcim flash` on the built module and the demo host.
#include "kldrcim/Cli.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Scripted_Programs.h"
#include "tests/support/Working_Folder.h"

namespace KPRV {
namespace {

/// What the program wrote and how it ended.
struct Outcome
{
    int status;
    std::string out;
    std::string error;
};

class Flash : public Module_Fixture
{
protected:
    static constexpr const char* HBA = "2000024b4c100000";

    void SetUp() override
    {
        Module_Fixture::SetUp();
        simulator.load_file(inventory("demo.json"));
        folder.write("fw.bin", "firmware-version=3.2.2.0\n");
    }

    Outcome run(std::vector<std::string> arguments)
    {
        // Who runs the tests may do so on a terminal.
        if (arguments[0] == "flash")
            arguments.push_back("--yes");
        arguments.insert(arguments.begin(), {"--module", KLDR_MODULE});
        testing::internal::CaptureStdout();
        testing::internal::CaptureStderr();
        const int status = kldrcim::run_cli(arguments);
        std::fflush(stdout);
        return {status, testing::internal::GetCapturedStdout(), testing::internal::GetCapturedStderr()};
    }
    void expect_updated(const std::string& adapter)
    {
        SCOPED_TRACE(adapter);
        simulator.load_file(inventory("demo.json"));
        const Outcome outcome = run({"flash", adapter, "file://fw.bin"});
        EXPECT_EQ(0, outcome.status);
        EXPECT_EQ(std::string(HBA) + ": firmware updated from 3.2.1.0 to 3.2.2.0\n", outcome.out);
        EXPECT_EQ(updating, outcome.error);
        EXPECT_EQ("20:00:02:4b:4c:10:00:00",
                  simulator.requests("adapterUpdateFlash").at(0)["indexStr"].asString());
        simulator.clear_calls();
    }
    void expect_no_adapter(const std::string& adapter)
    {
        const Outcome outcome = run({"flash", adapter, "file://fw.bin"});
        EXPECT_EQ(2, outcome.status);
        EXPECT_EQ("", outcome.out);
        EXPECT_EQ("kldrcim: no adapter \"" + adapter +
                      "\"; \"kldrcim ein KALDERA_PortController\" lists them\n",
                  outcome.error);
        EXPECT_TRUE(simulator.requests("adapterUpdateFlash").empty());
    }
    void expect_failed(const std::string& uri, const char* returned = "2")
    {
        const Outcome outcome = run({"flash", HBA, uri});
        EXPECT_EQ(1, outcome.status);
        EXPECT_EQ("", outcome.out);
        EXPECT_EQ(updating + "kldrcim: " + HBA + ": the update failed (return value " + returned +
                      "); the module's log says why\n",
                  outcome.error);
    }
    std::string first_path(const char* class_name)
    {
        const std::string paths = run({"ein", class_name}).out;
        return paths.substr(0, paths.find('\n'));
    }

    Working_Folder folder;
    const std::string updating =
        "kldrcim: " + std::string(HBA) + ": updating; SIGINT, SIGTERM and SIGHUP wait for the end of it\n";
};

TEST_F(Flash, TakesAnAddressInAnyForm)
{
    for (const char* form : {HBA, "20:00:02:4b:4c:10:00:00", "20:00:02:4B:4C:10:00:00", "2000024B4C100000",
                             "20-00-02-4b-4c-10-00-00", "2000.024b.4c10.0000"})
        expect_updated(form);
}

TEST_F(Flash, TakesAPath)
{
    const std::string path = first_path("KALDERA_PortController");
    expect_updated(path);
    expect_updated(path.substr(path.find(':') + 1));
}

TEST_F(Flash, TakesTheMacOfAConvergedAdapter)
{
    const Outcome outcome = run({"flash", "02:4b:4c:20:00:00", "file://fw.bin"});
    EXPECT_EQ(0, outcome.status);
    EXPECT_EQ("024b4c200000: firmware updated from 3.2.1.0 to 3.2.2.0\n", outcome.out);
}

TEST_F(Flash, KnowsNoOtherAdapter)
{
    for (const std::string& adapter :
         {std::string("2000024b4c999999"), std::string("20:00:02:4b:4c:10:00"), std::string(),
          std::string("10:00:02:4b:4c:10:00:00"), std::string("KALDERA_PortController"),
          std::string("KALDERA_PortController.DeviceID=\"2000024b4c100000\""),
          first_path("KALDERA_ComputerSystem")})
        expect_no_adapter(adapter);
    simulator.load_file(inventory("empty.json"));
    expect_no_adapter(HBA);
}

TEST_F(Flash, SaysWhenItFailed)
{
    folder.write("empty.bin", "");
    for (const char* uri : {"fw.bin", "FILE://fw.bin", "file://", "file://nowhere.bin", "file://empty.bin",
                            "tftp://h/fw.bin", ""})
        expect_failed(uri);
    simulator.add_fault(R"({"call": "adapterUpdateFlash", "do": "throw"})");
    expect_failed("file://fw.bin");
}

TEST_F(Flash, FetchesByTftp)
{
    Scripted_Programs programs;
    programs.program("rm");
    programs.program("tftp", "echo firmware-version=3.3.0.0 > \"$4\"");
    const Outcome outcome = run({"flash", HBA, "tftp://10.1.2.3/new.bin"});
    EXPECT_EQ(0, outcome.status) << outcome.error;
    EXPECT_EQ(std::string(HBA) + ": firmware updated from 3.2.1.0 to 3.3.0.0\n", outcome.out);
    EXPECT_EQ((Lines{"rm [-f] [new.bin]", "tftp [10.1.2.3] [-c] [get] [new.bin]"}), programs.runs());
}

TEST_F(Flash, SaysWhereTheVersionStays)
{
    folder.write("same.bin", "no version");
    EXPECT_EQ(std::string(HBA) + ": firmware updated, still version 3.2.1.0\n",
              run({"flash", HBA, "file://same.bin"}).out);
}

TEST_F(Flash, TellsItInJsonToo)
{
    Outcome outcome = run({"--format", "json", "flash", HBA, "file://fw.bin"});
    EXPECT_EQ(0, outcome.status);
    EXPECT_EQ(
        "{\n  \"adapter\": \"2000024b4c100000\",\n  \"uri\": \"file://fw.bin\",\n  \"return_value\": 0,\n"
        "  \"firmware_before\": \"3.2.1.0\",\n  \"firmware_after\": \"3.2.2.0\"\n}\n",
        outcome.out);
    outcome = run({"--format", "json", "flash", HBA, "file://none.bin"});
    EXPECT_EQ(1, outcome.status);
    EXPECT_NE(std::string::npos, outcome.out.find("\"return_value\": 2,"));
    EXPECT_NE("", outcome.error);
}

TEST_F(Flash, WantsTwoArguments)
{
    const char* const usage = "kldrcim: usage: kldrcim [options] flash ADAPTER URI\n";
    for (const std::vector<std::string>& words :
         {std::vector<std::string>{"flash"}, {"flash", HBA}, {"flash", HBA, "file://fw.bin", "more"}}) {
        const Outcome outcome = run(words);
        EXPECT_EQ(2, outcome.status);
        EXPECT_EQ(usage, outcome.error);
    }
    EXPECT_EQ(2, run({"--format", "mof", "flash", HBA, "file://fw.bin"}).status);
    EXPECT_TRUE(simulator.requests("adapterUpdateFlash").empty());
}

} // namespace
} // namespace KPRV
