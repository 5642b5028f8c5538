#pragma once

#include "tests/module/alerts/Taken_Alerts.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {

/// A helper with a filled catalogue, over a scripted library, on a host with the address 10.0.0.1.
class Event_Fixture : public testing::Test
{
protected:
    Event_Fixture()
    {
        helper.initEventDetailsMaps();
        log.clear();
    }
    ~Event_Fixture() override { EXPECT_TRUE(take_alerts(helper).empty()) << "left over"; }

    /// The text of an event, with further members as JSON, if any.
    static std::string text(int category, int id, const std::string& more = "")
    {
        return R"({"eventCategory": )" + std::to_string(category) + R"(, "eventId": )" + std::to_string(id) +
               (more.empty() ? "" : ", " + more) + "}";
    }

    /// Processes an event and gives its alerts.
    std::vector<Alert> alerts_of(const std::string& event)
    {
        const int result = helper.processEvent(event.c_str());
        std::vector<Alert> alerts = take_alerts(helper);
        EXPECT_EQ(alerts.empty() ? 0 : 1, result) << event;
        return alerts;
    }
    std::vector<Alert> alerts_of(int category, int id, const std::string& more = "")
    {
        return alerts_of(text(category, id, more));
    }

    static std::string port_path(const char* port_class, const std::string& id)
    {
        return std::string("//10.0.0.1/root/kaldera:") + port_class +
               ".SystemCreationClassName=\"KALDERA_ComputerSystem\",SystemName=\"10.0.0.1\"," +
               "CreationClassName=\"" + port_class + "\",DeviceID=\"" + id + "\"";
    }

    const Fixed_Host host;
    const Log_Capture log;
    Fake_Library library;
    IndicationHelper helper;
};

} // namespace KPRV
