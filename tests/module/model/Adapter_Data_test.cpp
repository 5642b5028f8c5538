#include "module/model/Adapter_Data.h"

#include "module/adapter/Json_Access.h"
#include "module/model/AdapterHelper.h"
#include "module/model/Record_Filling.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

_adapterData filled(const std::string& hba_data)
{
    _adapterData adapter = {};
    copy_text(adapter.serialNumber, "S1");
    AdapterHelper::getAdapterHelperInstance()->fillVPDInfo(json(hba_data), &adapter);
    return adapter;
}

} // namespace

TEST(Adapter_Data, TextsAreCutAndTerminated)
{
    char field[4] = {'#', '#', '#', '#'};
    copy_text(field, "abc");
    EXPECT_STREQ(field, "abc");
    copy_text(field, "abcd");
    EXPECT_STREQ(field, "abc");
    copy_text(field, "");
    EXPECT_STREQ(field, "");
}

TEST(Adapter_Data, Widths)
{
    EXPECT_EQ(sizeof _adapterData::nodeWWN, 24u);
    EXPECT_EQ(sizeof _adapterData::mac, 18u);
    EXPECT_EQ(sizeof _adapterData::model, 16u);
    EXPECT_EQ(sizeof _adapterData::serialNumber, 64u);
    EXPECT_EQ(sizeof _adapterData::vendor, 16u);
    EXPECT_EQ(sizeof _adapterData::fruNumber, 16u);
    EXPECT_EQ(sizeof _adapterData::partNumber, 16u);
    EXPECT_EQ(sizeof _adapterData::storageDriverName, 16u);
    EXPECT_EQ(sizeof _adapterData::storageDriverVersion, 64u);
    EXPECT_EQ(sizeof _adapterData::networkDriverName, 16u);
    EXPECT_EQ(sizeof _adapterData::networkDriverVersion, 64u);
    EXPECT_EQ(sizeof _adapterData::firmwareVersion, 64u);
    EXPECT_EQ(sizeof _adapterData::biosVersion, 64u);
    EXPECT_EQ(sizeof _adapterData::uuid, 33u);
}

TEST(Adapter_Data, VitalProductData)
{
    Log_Capture log;
    const auto adapter = filled("{'oem': 'ACME', 'fruNum': 'F1', 'partNum': 'P1', 'uuid': 'U1'}");
    EXPECT_STREQ(adapter.fruNumber, "F1");
    EXPECT_STREQ(adapter.partNumber, "P1");
    EXPECT_STREQ(adapter.serialNumber, "S1");
    EXPECT_STREQ(adapter.uuid, "U1");
    EXPECT_EQ(log.said(), Lines{"DBG Adapter vendor code is :ACME"});
    EXPECT_EQ(log.traces(), (Lines{"DBG Entering: fillVPDInfo", "DBG Returning: fillVPDInfo"}));
}

TEST(Adapter_Data, VitalProductDataOfNothing)
{
    const auto adapter = filled("{}");
    EXPECT_STREQ(adapter.fruNumber, "");
    EXPECT_STREQ(adapter.partNumber, "");
    EXPECT_STREQ(adapter.serialNumber, "S1");
    EXPECT_STREQ(adapter.uuid, "");
}

TEST(Adapter_Data, TwoVendorsHaveNoFru)
{
    Log_Capture log("INFO");
    for (const char* vendor : {"HP", "hpq", "DELL", "Dell Inc."})
        EXPECT_STREQ(filled(std::string("{'oem': '") + vendor + "', 'fruNum': 'F1'}").fruNumber, "")
            << vendor;
    EXPECT_EQ(log.said(), (Lines{"INFO HP VPD info doesnt have the FRU details to print.",
                                 "INFO hpq VPD info doesnt have the FRU details to print.",
                                 "INFO DELL VPD info doesnt have the FRU details to print.",
                                 "INFO Dell Inc. VPD info doesnt have the FRU details to print."}));
    for (const char* vendor : {"H", "DEL", "XHP", "IBM"})
        EXPECT_STREQ(filled(std::string("{'oem': '") + vendor + "', 'fruNum': 'F1'}").fruNumber, "F1")
            << vendor;
}

TEST(Adapter_Data, AnOemSerialNumberReplacesTheCardS)
{
    EXPECT_STREQ(filled("{'oemSerialNum': 'ABC123', 'partNum': 'ABC'}").serialNumber, "123");
    EXPECT_STREQ(filled("{'oemSerialNum': 'ABC123', 'partNum': 'XYZ'}").serialNumber, "ABC123");
    EXPECT_STREQ(filled("{'oemSerialNum': '', 'partNum': 'XYZ'}").serialNumber, "S1");
    EXPECT_STREQ(filled("{'oemSerialNum': 'ABC', 'partNum': 'ABC'}").serialNumber, "");
    // The part number is cut from the front before it is cut to its own width.
    const std::string part(20, 'P');
    const auto adapter = filled("{'oemSerialNum': '" + part + "7', 'partNum': '" + part + "'}");
    EXPECT_STREQ(adapter.serialNumber, "7");
    EXPECT_EQ(adapter.partNumber, std::string(15, 'P'));
}

TEST(Adapter_Data, LongTexts)
{
    Log_Capture log;
    const std::string oem(200, 'V'), serial(80, 'S'), uuid(36, 'U'), fru(20, 'F');
    const auto adapter = filled("{'oem': '" + oem + "', 'oemSerialNum': '" + serial + "', 'uuid': '" + uuid +
                                "', 'fruNum': '" + fru + "'}");
    EXPECT_EQ(adapter.serialNumber, std::string(63, 'S'));
    EXPECT_EQ(adapter.uuid, std::string(32, 'U'));
    EXPECT_EQ(adapter.fruNumber, std::string(15, 'F'));
    const std::string line = "Adapter vendor code is :" + oem;
    EXPECT_EQ(log.said(), Lines{"DBG " + line.substr(0, 127)});
}

TEST(Adapter_Data, ATextEndsAtAZeroCharacter)
{
    Json::Value hba_data;
    hba_data["uuid"] = std::string("U\0V", 3);
    _adapterData adapter = {};
    AdapterHelper::getAdapterHelperInstance()->fillVPDInfo(hba_data, &adapter);
    EXPECT_STREQ(adapter.uuid, "U");
}

TEST(Adapter_Data, WrongTypes)
{
    for (const char* name : {"oem", "fruNum", "partNum", "oemSerialNum", "uuid"})
        EXPECT_THROW(filled(std::string("{'") + name + "': 5}"), Not_Convertible) << name;
}
