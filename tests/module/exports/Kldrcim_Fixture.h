#pragma once

#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

#include <sys/wait.h>

namespace KPRV {

/// kldrcim as users run it: over the built module and the simulator.
class Kldrcim_Fixture : public ::testing::Test
{
protected:
    struct Outcome
    {
        int status;
        std::string out;
        std::string error;
    };

    /// `arguments` as a shell reads them.
    Outcome kldrcim(const std::string& arguments, const std::string& libraries = KLDR_SIMULATOR_FOLDER)
    {
        const std::string command = "LC_ALL=C.UTF-8 HOME=" + folder.path() + " LD_LIBRARY_PATH=" + libraries +
                                    " KLDR_SIMULATOR_INVENTORY=" + inventory + " " KLDRCIM " " + arguments +
                                    " >" + folder.path("out") + " 2>" + folder.path("error");
        const int status = std::system(command.c_str());
        return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, folder.read("out"), folder.read("error")};
    }
    /// Bad input: what is wrong with it is said in one line, and nothing else happens.
    void expect_mistake(const std::string& arguments, const std::string& error)
    {
        const Outcome run = kldrcim(arguments);
        EXPECT_EQ(2, run.status) << arguments;
        EXPECT_EQ("", run.out) << arguments;
        EXPECT_EQ("kldrcim: " + error + "\n", run.error) << arguments;
    }
    /// From now on over this inventory.
    void with(const std::string& json)
    {
        folder.write("inventory.json", json);
        inventory = folder.path("inventory.json");
    }
    static bool has(const std::string& text, const std::string& words)
    {
        return text.find(words) != std::string::npos;
    }

    Temp_Folder folder;
    std::string inventory = KLDR_INVENTORIES "/demo.json";
};

} // namespace KPRV
