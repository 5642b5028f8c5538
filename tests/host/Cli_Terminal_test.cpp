// What the program writes on a terminal.
#include "Run_Kldrcim.h"

#include <gtest/gtest.h>
#include <pty.h>
#include <unistd.h>

namespace KPRV::host {
namespace {

/// The first lines that the program writes on a terminal of that width.
std::string on_terminal(unsigned short width, const char* columns)
{
    winsize size = {.ws_row = 24, .ws_col = width, .ws_xpixel = 0, .ws_ypixel = 0};
    int terminal = -1;
    pid_t child = forkpty(&terminal, nullptr, nullptr, &size);
    if (child == 0) {
        execl(KLDRCIM, "kldrcim", "--module", TOY_DESCRIBED, "--namespace", "root/toy", "ei", "TOY_Item",
              "--properties", columns, static_cast<char*>(nullptr));
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

} // namespace
} // namespace KPRV::host
