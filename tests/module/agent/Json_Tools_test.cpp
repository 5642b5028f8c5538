#include "module/agent/Json_Tools.h"

#include <gtest/gtest.h>

#include <limits>
#include <new>

namespace KPRV {
namespace {

TEST(Json_Tools, KeepTheTextOfTheLastReply)
{
    Json_Tools tools;
    EXPECT_STREQ("{}\n", tools.keep("{}\n").c_str());
    EXPECT_STREQ("[]\n", tools.keep("[]\n").c_str());
    EXPECT_STREQ("[]\n", tools.reply.c_str());
}

TEST(Json_Tools, DoNotCutAReplyOfFourGigabytes)
{
    Json_Tools tools;
    tools.keep("{}\n");
    // The last two are sizes on 64 bits only.
    for (const uint64 size : {uint64(NPOS), uint64(NPOS) + 1, uint64(NPOS) + 4})
        if (size <= std::numeric_limits<size_t>::max()) {
            EXPECT_THROW(tools.keep({"[]\n", static_cast<size_t>(size)}), std::bad_alloc) << size;
        }
    EXPECT_STREQ("{}\n", tools.reply.c_str());
}

} // namespace
} // namespace KPRV
