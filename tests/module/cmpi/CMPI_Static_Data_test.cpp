#include "module/cmpi/CMPI_Static_Data.h"
#include "tests/module/cmpi/Test_Server.h"

using namespace KPRV;

TEST(CMPI_Static_Data, LayoutIsFixed)
{
    constexpr bool narrow = sizeof(void*) == 4;
    EXPECT_EQ(sizeof(CMPI_Static_Data), narrow ? 1200u : 1344u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, magic), 0u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, adapter), narrow ? 4u : 8u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, instance_ft), narrow ? 8u : 16u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, method_ft), narrow ? 52u : 96u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, indication_ft), narrow ? 72u : 128u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, association_ft), narrow ? 112u : 200u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, instance_mi), narrow ? 144u : 256u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, method_mi), narrow ? 152u : 272u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, association_mi), narrow ? 160u : 288u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, indication_mi), narrow ? 168u : 304u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, instance_name), narrow ? 176u : 320u);
    EXPECT_EQ(offsetof(CMPI_Static_Data, association_name), narrow ? 944u : 1088u);
}

TEST(CMPI_Static_Data, TablesAreOfVersion100AndHaveNoEmptySlot)
{
    CMPI_Static_Data data = {};
    fill(&data, nullptr, "Sample_Provider");
    const auto versions = [](const auto& ft) { return std::pair(int(ft.ftVersion), ft.miVersion); };
    EXPECT_EQ(versions(data.instance_ft), std::pair(100, 100));
    EXPECT_EQ(versions(data.method_ft), std::pair(100, 100));
    EXPECT_EQ(versions(data.indication_ft), std::pair(100, 100));
    EXPECT_EQ(versions(data.association_ft), std::pair(100, 100));

    const auto no_null_function = [](const auto& ft) {
        // Functions begin behind the two version words and the name.
        const void* const* slot = reinterpret_cast<const void* const*>(&ft.cleanup);
        for (; slot < reinterpret_cast<const void* const*>(&ft + 1); slot++) {
            if (!*slot)
                return false;
        }
        return true;
    };
    EXPECT_TRUE(no_null_function(data.instance_ft));
    EXPECT_TRUE(no_null_function(data.method_ft));
    EXPECT_TRUE(no_null_function(data.indication_ft));
    EXPECT_TRUE(no_null_function(data.association_ft));
}

TEST(CMPI_Static_Data, TheInstanceTableBearsTheNameOfTheAssociation)
{
    CMPI_Static_Data data = {};
    fill(&data, nullptr, "Sample_Provider");
    EXPECT_EQ(data.instance_ft.miName, data.association_name);
    EXPECT_STREQ(data.instance_ft.miName, "associationSample_Provider");
    EXPECT_EQ(data.method_ft.miName, nullptr);
    EXPECT_EQ(data.indication_ft.miName, nullptr);
    EXPECT_EQ(data.association_ft.miName, nullptr);
    EXPECT_STREQ(data.instance_name, "instanceSample_Provider");
    EXPECT_STREQ(data.method_name, "methodSample_Provider");
    EXPECT_STREQ(data.indication_name, "indicationSample_Provider");
}

TEST(CMPI_Static_Data, NamesAreCutAt255Characters)
{
    CMPI_Static_Data data = {};
    const std::string provider_name(300, 'p');
    fill(&data, nullptr, provider_name.c_str());
    EXPECT_EQ(std::string(data.instance_name), ("instance" + provider_name).substr(0, 255));
    EXPECT_EQ(std::string(data.association_name), ("association" + provider_name).substr(0, 255));
}

TEST(CMPI_Static_Data, MagicAndAdapterComeFirst)
{
    CMPI_Static_Data data = {};
    auto* const adapter = reinterpret_cast<CMPI_Adapter*>(&data);
    fill(&data, adapter, "Sample_Provider");
    EXPECT_EQ(data.magic, 0x5DE2B131u);
    EXPECT_EQ(data.adapter, adapter);
    EXPECT_EQ(data.instance_mi.hdl, nullptr) << "the factory's business";
}
