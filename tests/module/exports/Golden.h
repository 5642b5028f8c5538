#pragma once

#include "broker/Local_Server.h"
#include "broker/values/Value_Text.h"
#include "module/adapter/ProviderUtil.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

namespace KPRV {

/// What the module calls the machine that it runs on, and how it came by that: 0 is an address.
struct This_Host
{
    std::string name;
    int code;

    static This_Host find()
    {
        char name[256] = {};
        const int code = ProviderUtil::getHostInfo(name, sizeof name);
        return {name, code};
    }
};

inline void replace_all(std::string& text, const std::string& what, const std::string& by)
{
    for (size_t at = 0; (at = text.find(what, at)) != std::string::npos; at += by.size())
        text.replace(at, what.size(), by);
}

/// Whole answers as MOF. The host's own name, which differs from machine to machine, is written @HOST@ where
/// it is a whole value: a short one may well be a part of another text.
inline std::string golden_text(const broker::Result& result, const std::string& host_name)
{
    std::string text;
    for (const broker::Instance_Value& instance : result.instances)
        text += broker::mof_instance(instance) + "\n";
    replace_all(text, broker::quoted(host_name), "\"@HOST@\"");
    return text;
}

/// Compares with a file of tests/module/golden. A text that differs is left in the build folder under the
/// same name, so that the two can be compared; the golden ones are written by people, from what the answers
/// must be.
inline void expect_golden(const std::string& name, const std::string& actual,
                          const std::string& extension = ".mof")
{
    std::ifstream file(KLDR_GOLDEN "/" + name + extension);
    const std::string expected((std::istreambuf_iterator<char>(file)), {});
    if (actual == expected)
        return;
    std::filesystem::create_directories("golden");
    std::ofstream("golden/" + name + extension) << actual;
    EXPECT_EQ(expected, actual) << "the answer lies in golden/" << name << extension
                                << " of the build folder";
}

} // namespace KPRV
