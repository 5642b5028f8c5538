#pragma once

#include <cstddef>
#include <deque>
#include <json/json.h>
#include <string>

namespace KPRV::simulator {

/// Remembers every call of an entry point, in order. A server may run for days on the simulator, so
/// of very many calls the oldest are forgotten.
class Recorder
{
public:
    static constexpr std::size_t MOST_CALLS = 65536;

    /// How many calls are remembered from now on, at least one.
    void keep(std::size_t most);
    void add(const char* symbol, const Json::Value& request);
    void clear() { _calls.clear(); }

    /// An array of {"call", "request"}, oldest first.
    Json::Value calls() const;

    /// How many calls of that entry point are remembered.
    std::size_t count(const std::string& symbol) const;

private:
    struct Call
    {
        const char* symbol;
        Json::Value request;
    };
    std::size_t _most = MOST_CALLS;
    std::deque<Call> _calls;
};

} // namespace KPRV::simulator
