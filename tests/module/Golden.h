#pragma once

#include "host/Host.h"
#include "host/Value_Text.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

namespace KPRV {

/// Whole answers as MOF. The host's own name, which differs from machine to machine, is written @HOST@.
inline std::string golden_text(const host::Result& result, const std::string& host_name)
{
    std::string text;
    for (const host::Instance_Value& instance : result.instances)
        text += host::mof_instance(instance) + "\n";
    for (size_t at = 0; !host_name.empty() && (at = text.find(host_name, at)) != std::string::npos;)
        text.replace(at, host_name.size(), "@HOST@");
    return text;
}

/// Compares with tests/module/golden/<name>.mof. A text that differs is left in the build folder under the
/// same name, so that the two can be compared; the golden ones are written by people, from what the answers
/// must be.
inline void expect_golden(const std::string& name, const std::string& actual)
{
    std::ifstream file(KLDR_GOLDEN "/" + name + ".mof");
    const std::string expected((std::istreambuf_iterator<char>(file)), {});
    if (actual == expected)
        return;
    std::filesystem::create_directories("golden");
    std::ofstream("golden/" + name + ".mof") << actual;
    EXPECT_EQ(expected, actual) << "the answer lies in golden/" << name << ".mof of the build folder";
}

} // namespace KPRV
