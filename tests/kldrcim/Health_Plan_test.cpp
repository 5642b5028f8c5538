// The table of findings: complete, in order, and what its page says.
#include "kldrcim/walks/Health_Plan.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <set>

namespace KPRV::kldrcim {
namespace {

std::vector<std::string> page_rows()
{
    std::ifstream page(KLDR_DOCS "/health.md");
    std::vector<std::string> rows;
    for (std::string line; std::getline(page, line);)
        if (line.starts_with("| `"))
            rows.push_back(line);
    return rows;
}

/// Between the bars, without the blanks that make columns.
std::vector<std::string> cells(const std::string& row)
{
    std::vector<std::string> texts;
    for (std::size_t from = 1, to = 0; (to = row.find('|', from)) != row.npos; from = to + 1) {
        std::string text = row.substr(from, to - from);
        text.erase(0, text.find_first_not_of(' '));
        text.erase(text.find_last_not_of(' ') + 1);
        texts.push_back(text);
    }
    return texts;
}

TEST(Health_Plan, ThePageHasTheSameTable)
{
    std::vector<std::vector<std::string>> expected, found;
    for (const Finding_Kind& kind : finding_kinds())
        expected.push_back({"`" + std::string(kind.name) + "`", rank_name(kind.rank), kind.words});
    for (const std::string& row : page_rows()) {
        std::vector<std::string> columns = cells(row);
        ASSERT_EQ(4u, columns.size()) << row;
        EXPECT_FALSE(columns.back().empty()) << row;
        columns.pop_back();
        found.push_back(columns);
    }
    EXPECT_EQ(expected, found);
}

TEST(Health_Plan, TheWorstComesFirstAndNamesAreUnique)
{
    std::set<std::string> names;
    Rank before = Rank::CRITICAL;
    for (const Finding_Kind& kind : finding_kinds()) {
        EXPECT_TRUE(names.insert(kind.name).second) << kind.name;
        EXPECT_EQ(before, worse(before, kind.rank)) << kind.name;
        EXPECT_EQ(&kind, find_finding(kind.name));
        before = kind.rank;
    }
    EXPECT_EQ(nullptr, find_finding("no-such-finding"));
}

TEST(Health_Plan, EachStatusThatIsNotOneOfServiceIsAFinding)
{
    for (const Node_Kind kind :
         {Node_Kind::ADAPTER, Node_Kind::FC_PORT, Node_Kind::ETHERNET_PORT, Node_Kind::TARGET})
        for (std::uint64_t status = 0; status < 20; ++status)
            EXPECT_EQ(status == 2 || status == 11, finding_of_status(kind, status) == nullptr) << status;
    EXPECT_EQ(finding_of_status(Node_Kind::FC_PORT, 13), finding_of_status(Node_Kind::ETHERNET_PORT, 13));
    EXPECT_STREQ("target-lost", finding_of_status(Node_Kind::TARGET, 13)->name);
}

TEST(Health_Plan, TheWorseOfTwoRanks)
{
    using enum Rank;
    EXPECT_EQ(WARNING, worse(OK, WARNING));
    EXPECT_EQ(UNKNOWN, worse(UNKNOWN, WARNING));
    EXPECT_EQ(CRITICAL, worse(UNKNOWN, CRITICAL));
    EXPECT_EQ(OK, worse(OK, OK));
}

} // namespace
} // namespace KPRV::kldrcim
