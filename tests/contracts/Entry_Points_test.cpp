#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using Names = std::vector<std::string>;

TEST(Entry_Points, AreNamedAndOrderedAsAdapterLibrariesHaveThem)
{
    const Names published = {
#include "tests/contracts/entry_points.inc"
    };
    const Names listed = {
#define ENTRY_POINT(symbol, variable, signature) #symbol,
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    };
    EXPECT_EQ(listed, published);
}

TEST(Entry_Points, AnswerJsonToJsonButForSix)
{
    const Names expected = {"getRequestID: voidRetIntFP",
                            "registerEventProcessingCb: evtProcessCBRetVoidFP",
                            "registerLogMsgCb: log4cxxMsgRetVoidFP",
                            "get_agt_version: voidRetStrFP",
                            "free_hba_lib: voidRetIntFP",
                            "getNumberOfAdapters: voidRetUIntFP"};
    Names others;
    for (const auto& [symbol, signature] : {
#define ENTRY_POINT(symbol, variable, signature) std::pair{std::string(#symbol), std::string(#signature)},
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
         })
        if (signature != "JsonReqFP")
            others.push_back(symbol + ": " + signature);
    EXPECT_EQ(others, expected);
}

} // namespace
