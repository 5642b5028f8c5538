// What the program writes on a terminal.
#include "tests/kldrcim/Run_Kldrcim.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>
#include <pty.h>
#include <unistd.h>

namespace KPRV::kldrcim {
namespace {

/// What the program writes on a terminal of that width.
std::string on_terminal(unsigned short width, std::vector<const char*> arguments, const char* kind = "xterm")
{
    winsize size = {.ws_row = 24, .ws_col = width, .ws_xpixel = 0, .ws_ypixel = 0};
    int terminal = -1;
    pid_t child = forkpty(&terminal, nullptr, nullptr, &size);
    if (child == 0) {
        setenv("TERM", kind, 1);
        setenv("LC_ALL", "C", 1);
        arguments.insert(arguments.begin(), "kldrcim");
        arguments.push_back(nullptr);
        execv(KLDRCIM, const_cast<char* const*>(arguments.data()));
        _exit(127);
    }
    std::string text;
    char buffer[1024];
    // The terminal answers an error, not an end, when its last process is gone.
    for (ssize_t count; (count = read(terminal, buffer, sizeof buffer)) > 0;)
        text.append(buffer, static_cast<std::size_t>(count));
    int status = 0;
    waitpid(child, &status, 0);
    close(terminal);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << text;
    std::erase(text, '\r');
    return text;
}

std::string on_terminal(unsigned short width, const char* columns)
{
    return on_terminal(width, {"--module", TOY_DESCRIBED, "--namespace", "root/toy", "ei", "TOY_Item",
                               "--properties", columns});
}

TEST(Cli_Terminal, ATableThatFitsIsATable)
{
    // 29 columns wide.
    const char* table = "Id  U8   U64\n"
                        "--  ---  --------------------\n"
                        "1   200  18000000000000000000\n"
                        "2   200  18000000000000000000\n";
    EXPECT_EQ(table, on_terminal(29, "Id,U8,U64"));
    EXPECT_EQ(table, on_terminal(80, "Id,U8,U64"));
}

TEST(Cli_Terminal, AWiderOneBecomesBlocks)
{
    std::string text = on_terminal(28, "Id,U8,U64");
    EXPECT_EQ(0u, text.find("root/toy:TOY_Item.Id=1,Name=\"one\"\n  Id  = 1\n  U8  = 200\n")) << text;
}

TEST(Cli_Terminal, ATerminalOfUnknownWidthGetsTheTable)
{
    EXPECT_EQ(0u, on_terminal(0, "Id,U8,U64").find("Id  U8   U64\n"));
}

TEST(Cli_Terminal, ATreeHasItsStatesInColor)
{
    const std::vector<const char*> tree = {"--module", TOY_FABRIC, "tree"};
    EXPECT_NE(std::string::npos, on_terminal(80, tree).find("2.5 Gb/s, \33[1;31mno contact\33[0m\n"));
    EXPECT_EQ(std::string::npos, on_terminal(80, tree, "dumb").find('\33'));
    EXPECT_EQ(std::string::npos,
              on_terminal(80, {"--module", TOY_FABRIC, "tree", "--color", "never"}).find('\33'));
    const Environment_Override no_color("NO_COLOR", "1");
    EXPECT_EQ(std::string::npos, on_terminal(80, tree).find('\33'));
}

} // namespace
} // namespace KPRV::kldrcim
