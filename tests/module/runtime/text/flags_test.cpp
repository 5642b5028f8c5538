#include "module/runtime/text/flags.h"

#include <gtest/gtest.h>

namespace KPRV {

struct Flag_Row
{
    sint32 bit;
    const char* name;
    Flag flag;
};

constexpr Flag_Row FLAG_ROWS[] = {
    {0, "Property", FLAG_PROPERTY},
    {1, "Reference", FLAG_REFERENCE},
    {2, "Method", FLAG_METHOD},
    {3, "Class", FLAG_CLASS},
    {4, "Abstract", FLAG_ABSTRACT},
    {5, "Aggregate", FLAG_AGGREGATE},
    {6, "Aggregation", FLAG_AGGREGATION},
    {7, "Association", FLAG_ASSOCIATION},
    {8, "Composition", FLAG_COMPOSITION},
    {9, "Counter", FLAG_COUNTER},
    {10, "Delete", FLAG_DELETE},
    {11, "DN", FLAG_DN},
    {12, "EmbeddedObject", FLAG_EMBEDDED_OBJECT},
    {13, "Exception", FLAG_EXCEPTION},
    {14, "Expensive", FLAG_EXPENSIVE},
    {15, "Experimental", FLAG_EXPERIMENTAL},
    {16, "Gauge", FLAG_GAUGE},
    {17, "IfDeleted", FLAG_IF_DELETED},
    {18, "In", FLAG_IN},
    {19, "Indication", FLAG_INDICATION},
    {20, "Invisible", FLAG_INVISIBLE},
    {21, "Key", FLAG_KEY},
    {22, "Large", FLAG_LARGE},
    {23, "OctetString", FLAG_OCTET_STRING},
    {24, "Out", FLAG_OUT},
    {25, "Read", FLAG_READ},
    {26, "Required", FLAG_REQUIRED},
    {27, "Static", FLAG_STATIC},
    {28, "Terminal", FLAG_TERMINAL},
    {29, "Weak", FLAG_WEAK},
    {30, "Write", FLAG_WRITE},
    {31, "EmbeddedInstance", FLAG_EMBEDDED_INSTANCE},
};

TEST(flags, EachNameStandsForItsBit)
{
    ASSERT_EQ(num_flag_names, std::size(FLAG_ROWS));
    for (const Flag_Row& row : FLAG_ROWS) {
        EXPECT_STREQ(row.name, flag_names[row.bit]);
        EXPECT_EQ(row.bit, flag_name_to_index(row.name));
        EXPECT_EQ(1u << row.bit, row.flag) << row.name;
    }
}

TEST(flags, NamesAreFoundInAnyCaseAndOnlyWhole)
{
    EXPECT_EQ(21, flag_name_to_index("KEY"));
    EXPECT_EQ(11, flag_name_to_index("dn"));
    EXPECT_EQ(31, flag_name_to_index("embeddedinstance"));
    EXPECT_EQ(-1, flag_name_to_index(""));
    EXPECT_EQ(-1, flag_name_to_index("Embedded"));
    EXPECT_EQ(-1, flag_name_to_index("Keys"));
}

} // namespace KPRV
