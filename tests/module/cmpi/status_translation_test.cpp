#include "module/cmpi/status_translation.h"

#include <gtest/gtest.h>
#include <map>

using namespace KPRV;

TEST(status_translation, EachFamilyReadsItsOwnStatusesAndNoOthers)
{
    using enum Status_Family;
    const std::map<Status_Family, std::map<int, int>> families = {
        {GET_INSTANCE, {{60, 6}, {61, 1}, {62, 4}, {63, 2}, {64, 1}}},
        {CREATE_INSTANCE, {{80, 11}, {81, 7}, {82, 4}, {83, 2}, {84, 1}}},
        {MODIFY_INSTANCE, {{100, 6}, {101, 7}, {102, 4}, {103, 2}, {104, 1}}},
        {DELETE_INSTANCE, {{90, 6}, {91, 7}, {92, 2}, {93, 1}}},
        {ENUM_INSTANCES, {{70, 1}, {71, 2}}},
        {INVOKE_METHOD, {{130, 1}, {131, 7}, {132, 2}}},
        {ENUM_ASSOCIATORS, {{170, 1}, {172, 2}}},
        {ENUM_ASSOCIATOR_NAMES, {{110, 1}, {111, 7}, {112, 2}}},
        {ENUM_REFERENCES, {{120, 1}, {121, 7}, {122, 2}}},
        {ENABLE_INDICATIONS, {{140, 1}}},
        {DISABLE_INDICATIONS, {{150, 1}}},
    };
    for (const auto& [family, rows] : families) {
        for (int status = -1; status < 200; status++) {
            const auto row = rows.find(status);
            EXPECT_EQ(translate(family, status), row == rows.end() ? 0 : row->second)
                << "family " << int(family) << ", status " << status;
        }
    }
}
