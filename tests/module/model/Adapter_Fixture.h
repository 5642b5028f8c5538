#pragma once

#include "module/model/AdapterHelper.h"
#include "module/model/Fresh_Instances.h"
#include "module/runtime/objects/Ref.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Instance_Text.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {

inline constexpr const char* WWN = "20:00:8c:7c:ff:00:00:01";
inline constexpr const char* MAC = "8c:7c:ff:00:00:02";

/// What the library answers for an FC HBA, for a CNA with both drivers, and for any of them with one member
/// changed.
inline Json::Value hba()
{
    return json(
        "{'hbaData': {'wwn': '20:00:8c:7c:ff:00:00:01', 'portCount': 2, 'serialNumber': 'S1', 'model': '825',"
        "             'hbaStatus': true, 'oem': 'ACME', 'fruNum': 'F1', 'partNum': 'P1', 'oemSerialNum': '',"
        "             'uuid': ''},"
        " 'driver': {'storageDriverName': 'sdrv', 'storageDriverVersion': ' 3.2.3 '},"
        " 'firmware': {'version': ' FW 1 ', 'biosVersion': ' BIOS 2 '}}");
}
inline Json::Value cna()
{
    Json::Value answer = hba();
    answer["hbaData"]["hbaMAC"] = MAC;
    answer["driver"]["networkDriverName"] = "ndrv";
    answer["driver"]["networkDriverVersion"] = " 3.2.4 ";
    return answer;
}
inline Json::Value with(Json::Value answer, const char* object, const char* member, const Json::Value& value)
{
    answer[object][member] = value;
    return answer;
}
inline Json::Value without(Json::Value answer, const char* object, const char* member)
{
    answer[object].removeMember(member);
    return answer;
}

struct Adapter_Fixture : testing::Test
{
    Fixed_Host host;
    Fake_Library library;
    Log_Capture log{"INFO"};

    Adapter_Fixture() { library.answers("getFlashInfo", json("{'flashStatus': true}")); }

    /// What is set in each instance of a class.
    std::vector<Set_Properties> walk(classId_t id)
    {
        std::vector<Set_Properties> result;
        for (Instance* instance : AdapterHelper::getAdapterHelperInstance()->getInstancesByClass(id)) {
            result.push_back(set_properties(instance));
            destroy(instance);
        }
        return result;
    }
    /// One property of each instance.
    Lines walk(classId_t id, const char* property)
    {
        Lines result;
        for (Set_Properties& set : walk(id))
            result.push_back(set[property]);
        return result;
    }
};

} // namespace KPRV
