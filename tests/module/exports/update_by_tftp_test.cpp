#include "tests/module/exports/Update_Fixture.h"
#include "tests/support/Scripted_Programs.h"
#include "tests/support/Tftp_Server.h"

namespace KPRV {
namespace {

using Update_By_Tftp = Update_Fixture;

TEST_F(Update_By_Tftp, RemovesThenFetchesThenUpdates)
{
    Scripted_Programs programs;
    programs.program("rm");
    programs.program("tftp", "echo firmware-version=3.2.3.0 > \"$4\"");
    const Lines calls = calls_of_an_update();
    EXPECT_EQ(0u, install("tftp://10.1.2.3/fw.bin"));
    EXPECT_EQ((Lines{"rm [-f] [fw.bin]", "tftp [10.1.2.3] [-c] [get] [fw.bin]"}), programs.runs());
    EXPECT_EQ(calls, simulator.call_names());
    EXPECT_EQ(request("fw.bin"), simulator.requests("adapterUpdateFlash").at(0));
    Lines expected = {"DBG Entering: InstallFromURI"};
    for (const std::string& line : of_helper("fw.bin", "DBG status=0 message = Flash update successful"))
        expected.push_back(line);
    for (const char* line :
         {"DBG Software update is success", "DBG return value = 0", "DBG Returning: InstallFromURI"})
        expected.push_back(line);
    EXPECT_EQ(expected, told_of_update());
    EXPECT_EQ("3.2.3.0", firmware());
    EXPECT_TRUE(std::filesystem::exists(folder.path("fw.bin"))) << "a fetched file stays";
}

TEST_F(Update_By_Tftp, WantsAHostOfTwoCharactersAndAFile)
{
    Scripted_Programs programs;
    programs.program("rm");
    programs.program("tftp");
    for (const char* uri :
         {"tftp://h/fw.bin", "tftp:///fw.bin", "tftp://host", "tftp://host/", "tftp://", "tftp:///"})
        expect_refusal(arguments(uri, options({5})), {}, "malformed tftp URI");
    EXPECT_TRUE(programs.runs().empty());
    // The shortest that is taken: here the client leaves no file.
    expect_refusal(arguments("tftp://hh/f", options({5})), {"ERR File doesnt exist"}, "File not exists");
    EXPECT_EQ((Lines{"rm [-f] [f]", "tftp [hh] [-c] [get] [f]"}), programs.runs());
}

TEST_F(Update_By_Tftp, ThatTheClientCannotDoAsksNoLibrary)
{
    Scripted_Programs programs;
    programs.program("rm");
    for (const char* end : {"exit 1", "exit 69", "kill -9 $$"}) {
        programs.program("tftp", end);
        folder.write("fw.bin", "of a former update");
        expect_refusal(arguments("tftp://host/fw.bin", options({5})), {}, "tftp command failed");
    }
}

TEST_F(Update_By_Tftp, WithoutAClientIsAFailure)
{
    Scripted_Programs none;
    expect_refusal(arguments("tftp://host/fw.bin", options({5})), {}, "tftp command failed");
}

TEST_F(Update_By_Tftp, GivesHostileNamesToNoShell)
{
    Scripted_Programs programs;
    programs.program("rm");
    programs.program("tftp");
    EXPECT_EQ(2u, install("tftp://a;echo>b/`echo>c` $(echo>d) & echo>e"));
    EXPECT_EQ((Lines{"rm [-f] [`echo>c` $(echo>d) & echo>e]",
                     "tftp [a;echo>b] [-c] [get] [`echo>c` $(echo>d) & echo>e]"}),
              programs.runs());
    EXPECT_TRUE(std::filesystem::is_empty(folder.path()));
}

TEST_F(Update_By_Tftp, WorksWithTheClientsAndServersOfTheField)
{
    Tftp_Server tftp;
    if (!tftp.problem().empty())
        GTEST_SKIP() << tftp.problem();
    tftp.files().write("fw.bin", "firmware-version=3.2.4.0\n" + std::string(100000, 'x'));
    folder.write("fw.bin", "firmware-version=0.0.0.0\n");
    EXPECT_EQ(0u, install("tftp://127.0.0.1/fw.bin"));
    EXPECT_EQ("3.2.4.0", firmware());
    EXPECT_EQ(tftp.files().read("fw.bin"), folder.read("fw.bin"));

    // This client succeeds where the server has no such file, and leaves an empty one: the library refuses
    // it.
    EXPECT_EQ(2u, install("tftp://127.0.0.1/none.bin"));
    EXPECT_EQ(1u, simulator.requests("adapterUpdateFlash").size());
    EXPECT_EQ(0u, std::filesystem::file_size(folder.path("none.bin")));
    // Below a folder that the host does not have, the client can write nothing.
    EXPECT_EQ(2u, install("tftp://127.0.0.1/below/fw.bin"));
    EXPECT_TRUE(simulator.call_names().empty());
    EXPECT_EQ("3.2.4.0", firmware());
}

} // namespace
} // namespace KPRV
