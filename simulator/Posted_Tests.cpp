#include "simulator/Posted_Tests.h"

#include <algorithm>
#include <utility>

namespace KPRV::simulator {

namespace {

// A server may run for days on the simulator: of very many requests the oldest are forgotten.
constexpr std::size_t MOST_REQUESTS = 1024;

constexpr const char* state_words[] = {"Unknown", "Posted", "Running", "Completed", "Cancelled"};

unsigned percent(Posted_Tests::Clock::duration part, Posted_Tests::Clock::duration whole)
{
    return whole.count() == 0 ? 100 : static_cast<unsigned>(part.count() * 100 / whole.count());
}

} // namespace

const Posted_Tests::Request* Posted_Tests::find(const std::string& id) const
{
    const auto found = std::find_if(_requests.begin(), _requests.end(),
                                    [&](const Request& request) { return request.id == id; });
    return found == _requests.end() ? nullptr : &*found;
}

Posted_Tests::Request* Posted_Tests::find(const std::string& id)
{
    return const_cast<Request*>(std::as_const(*this).find(id));
}

Posted_Tests::State Posted_Tests::state(const std::string& id, Clock::time_point now) const
{
    const Request* request = find(id);
    if (!request)
        return State::UNKNOWN;
    if (request->cancelled)
        return State::CANCELLED;
    if (!request->started)
        return State::POSTED;
    return now < request->end ? State::RUNNING : State::COMPLETED;
}

void Posted_Tests::post(const std::string& id, const Json::Value& query, const std::string& failure,
                        std::chrono::milliseconds duration)
{
    if (!find(id)) {
        if (_requests.size() == MOST_REQUESTS)
            _requests.pop_front();
        _requests.emplace_back().id = id;
    }
    find(id)->tests.push_back({query, failure, duration});
}

void Posted_Tests::start(const std::string& id, bool stop_on_error, Clock::time_point now)
{
    Request& request = *find(id);
    request.started = true;
    request.stop_on_error = stop_on_error;
    request.start = request.end = now;
    for (const Test& test : request.tests) {
        request.end += test.duration;
        if (stop_on_error && !test.failure.empty())
            break;
    }
}

void Posted_Tests::cancel(const std::string& id, Clock::time_point now)
{
    Request& request = *find(id);
    request.cancelled = true;
    request.end = now;
    if (!request.started)
        request.start = now;
}

Json::Value Posted_Tests::results(const std::string& id, Clock::time_point now) const
{
    const Request& request = *find(id);
    Json::Value answer;
    answer["requestID"] = id;
    answer["state"] = state_words[static_cast<int>(state(id, now))];
    answer["results"] = Json::Value(Json::arrayValue);
    const bool begun = request.started || request.cancelled;
    const Clock::time_point seen = std::min(now, request.end);
    Clock::time_point begin = request.start;
    bool stopped = false;
    for (const Test& test : request.tests) {
        Json::Value result = test.query;
        result.removeMember("requestID");
        const Clock::time_point end = begin + test.duration;
        if (!begun)
            result["state"] = "Posted";
        else if (stopped)
            result["state"] = "Not run";
        else if (!request.started || (request.cancelled && end > request.end))
            result["state"] = "Cancelled";
        else if (seen < end)
            result["state"] = begin <= seen ? "Running" : "Posted";
        else {
            result["state"] = "Completed";
            result["result"] = test.failure.empty() ? "Passed" : "Failed";
            if (!test.failure.empty())
                result["reason"] = test.failure;
        }
        if (result["state"] == "Running")
            result["percentComplete"] = percent(seen - begin, test.duration);
        stopped = stopped || (request.stop_on_error && result["result"] == "Failed");
        begin = end;
        answer["results"].append(result);
    }
    return answer;
}

} // namespace KPRV::simulator
