#pragma once

#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Eventually.h"

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <thread>

namespace KPRV {

inline const char* const CLASS = "KALDERA_AlertIndication";
inline const char* const PORT = "1000024b4c100000";

/// What came in, as "name space text".
using Texts = std::vector<std::string>;

/// A subscriber to the alerts of the module, once the module is open.
class Alert_Fixture : public Module_Fixture
{
protected:
    void take_alerts()
    {
        server->set_sink([this](const std::string& name_space, const broker::Instance_Value& alert) {
            const std::lock_guard lock(_mutex);
            _alerts.emplace_back(name_space, alert);
            _came.notify_all();
            return CMPI_RC_OK;
        });
    }
    static std::string event(int category, int id, const std::string& more = "")
    {
        return R"({"eventSeverity": 2, "eventCategory": )" + std::to_string(category) + R"(, "eventId": )" +
               std::to_string(id) + R"(, "portIndexString": ")" + PORT + "\"" + more + "}";
    }
    bool wait_for(size_t count)
    {
        std::unique_lock lock(_mutex);
        return _came.wait_for(lock, PATIENCE, [&] { return _alerts.size() >= count; });
    }
    std::vector<broker::Instance_Value> alerts()
    {
        const std::lock_guard lock(_mutex);
        std::vector<broker::Instance_Value> list;
        for (const auto& [name_space, alert] : _alerts)
            list.push_back(alert);
        return list;
    }
    /// "name space MessageID" of each, in order.
    Texts came()
    {
        const std::lock_guard lock(_mutex);
        Texts texts;
        for (const auto& [name_space, alert] : _alerts)
            texts.push_back(name_space + " " + text_of(alert, "MessageID"));
        return texts;
    }
    /// Waits for as long as the delivery thread needs for some passes.
    static void let_pass() { std::this_thread::sleep_for(std::chrono::milliseconds(60)); }

private:
    std::mutex _mutex;
    std::condition_variable _came;
    std::vector<std::pair<std::string, broker::Instance_Value>> _alerts;
};

} // namespace KPRV
