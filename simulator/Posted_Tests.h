#pragma once

#include <chrono>
#include <deque>
#include <json/json.h>
#include <string>
#include <vector>

namespace KPRV::simulator {

/// Tests that wait, run or have run, by the request id under which they were posted. They run one after
/// the other, by the clock alone: nothing happens between two questions.
class Posted_Tests
{
public:
    using Clock = std::chrono::steady_clock;

    enum class State
    {
        UNKNOWN, // nothing was posted under this id
        POSTED,
        RUNNING,
        COMPLETED,
        CANCELLED,
    };

    State state(const std::string& id, Clock::time_point now = Clock::now()) const;

    /// Adds a test to a request that is not started, or makes the request. `failure` is why the test will
    /// fail, empty if it will pass.
    void post(const std::string& id, const Json::Value& query, const std::string& failure,
              std::chrono::milliseconds duration);

    /// Both of a known request only.
    void start(const std::string& id, bool stop_on_error, Clock::time_point now = Clock::now());
    void cancel(const std::string& id, Clock::time_point now = Clock::now());

    /// The answer of getDiagnosticsResults for a known request.
    Json::Value results(const std::string& id, Clock::time_point now = Clock::now()) const;

private:
    struct Test
    {
        Json::Value query;
        std::string failure;
        std::chrono::milliseconds duration;
    };

    struct Request
    {
        std::string id;
        std::vector<Test> tests;
        bool started = false;
        bool cancelled = false;
        bool stop_on_error = false;
        Clock::time_point start;
        Clock::time_point end; // of the last test that runs; when cancelled, of the running one
    };

    const Request* find(const std::string& id) const;
    Request* find(const std::string& id);

    std::deque<Request> _requests;
};

} // namespace KPRV::simulator
