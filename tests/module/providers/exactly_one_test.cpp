#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

/// Providers of which there is one instance or something is wrong, over lists that no host gives.
class Exactly_One : public Association_Fixture
{
};

struct One_Row
{
    const char* class_name;
    const char* elements;
    size_t delivered;
    const char* said;
    int status;
};

// clang-format off
constexpr One_Row one_rows[] = {
//   class                                         elements   delivered  line of the log                                                      status
    {"ComputerSystem",                             "a",       1,         "DBG Returning instances",                                           0},
    {"ComputerSystem",                             "",        0,         "ERR Error: Invalid mapping information",                            70},
    {"ComputerSystem",                             "a, b",    0,         "ERR Error: Invalid mapping information",                            70},
    {"ProfileSoftwareIdentity",                    "a",       1,         "DBG Returning instances",                                           0},
    {"ProfileSoftwareIdentity",                    "",        0,         "ERR Error: Invalid number of ProfileSoftwareIdentity Instances",    70},
    {"ProfileSoftwareIdentity",                    "a, b",    0,         "ERR Error: Invalid number of ProfileSoftwareIdentity Instances",    70},
    {"RemoteServiceAccessPoint",                   "a",       1,         "DBG Returning instances",                                           0},
    {"RemoteServiceAccessPoint",                   "",        0,         "WARN Warning: No service is available",                             0},
    {"RemoteServiceAccessPoint",                   "a, b",    0,         "ERR Error: Invalid mapping information",                            70},
    // Said as an error, and a success to the client all the same.
    {"HBASoftwareInstallationService",             "a",       1,         "DBG Returning instances",                                           0},
    {"HBASoftwareInstallationService",             "",        0,         "ERR Error: Invalid mapping information",                            0},
    {"HBASoftwareInstallationService",             "a, b",    0,         "ERR Error: Invalid mapping information",                            0},
    {"HBASoftwareInstallationServiceCapabilities", "a",       1,         "DBG Returning instances",                                           0},
    {"HBASoftwareInstallationServiceCapabilities", "",        0,         "ERR Error: Invalid mapping information",                            0},
    {"HBASoftwareInstallationServiceCapabilities", "a, b",    0,         "ERR Error: Invalid mapping information",                            0},
};
// clang-format on

TEST_F(Exactly_One, OrTheWordsAndTheStatusOfTheClass)
{
    for (const One_Row& row : one_rows) {
        SCOPED_TRACE(std::string(row.class_name) + " of " + row.elements);
        lists(*row.elements ? std::string(row.class_name) + ": " + row.elements : "");
        const Enumeration result = enumerate(row.class_name, "");
        EXPECT_EQ(row.delivered, result.pairs.size());
        EXPECT_EQ(Lines{row.class_name}, result.fetched);
        EXPECT_EQ(Lines{row.said}, result.said);
        EXPECT_EQ(row.status, result.status);
        EXPECT_EQ(std::vector<int>{row.status}, result.end_marks);
    }
}

} // namespace
} // namespace KPRV
