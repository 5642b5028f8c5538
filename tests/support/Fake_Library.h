#pragma once

#include "contracts/adapter/HbaAgentError.h"
#include "module/adapter/CIMProviderZntj.h"

#include <json/reader.h>
#include <json/value.h>
#include <json/writer.h>

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <stdexcept>
#include <string>
#include <vector>

namespace KPRV {

/// A JSON text as a value; a faulty text fails the test.
inline Json::Value json(const std::string& text)
{
    Json::CharReaderBuilder builder;
    builder["allowSingleQuotes"] = true;
    builder["strictRoot"] = false;
    Json::Value value;
    std::string errors;
    const std::unique_ptr<Json::CharReader> reader(builder.newCharReader());
    if (!reader->parse(text.data(), text.data() + text.size(), &value, &errors))
        throw std::invalid_argument(text + ": " + errors);
    return value;
}

inline std::string compact(const Json::Value& value)
{
    Json::StreamWriterBuilder builder;
    builder["indentation"] = "";
    return Json::writeString(builder, value);
}

/// Stands behind the entry-point variables for a scope: answers as told, null where nothing was told, and
/// keeps the calls with their requests in order. Entry points go by their exported names. Threads of the code
/// under test may call at once; answers run outside the lock, so that one may wait for another.
///
///     Fake_Library library;
///     library.answers("getFlashInfo", json("{'flashStatus': true}"));
///     library.throws("getHbaByWwn", HbaAgentError{7, "busy"});
class Fake_Library
{
public:
    using Answer = std::function<Json::Value(const Json::Value& request)>;
    struct Call
    {
        std::string name;
        Json::Value request;
        bool operator==(const Call&) const = default;
    };

    Fake_Library()
    {
        current() = this;
#define ENTRY_POINT(symbol, variable, signature) stand_in<name_of_##symbol>(variable);
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    }
    ~Fake_Library()
    {
        current() = nullptr;
#define ENTRY_POINT(symbol, variable, signature) variable = &default_##signature;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    }
    Fake_Library(const Fake_Library&) = delete;
    Fake_Library& operator=(const Fake_Library&) = delete;

    /// Every call is answered so.
    void answers(const std::string& symbol, const Json::Value& answer)
    {
        const std::lock_guard lock(_mutex);
        _answers[symbol] = [answer](const Json::Value&) { return answer; };
    }
    void answers(const std::string& symbol, Answer answer)
    {
        const std::lock_guard lock(_mutex);
        _answers[symbol] = std::move(answer);
    }
    /// Every call throws so.
    template <class Error>
    void throws(const std::string& symbol, const Error& error)
    {
        _answers[symbol] = [error](const Json::Value&) -> Json::Value { throw error; };
    }

    std::vector<Call> calls;
    /// What the library would tell events to, and what happens as soon as that is set.
    evtProcessCB event_callback = nullptr;
    std::function<void()> on_event_callback;
    /// What the entry points that speak no JSON answer.
    const char* version = nullptr;
    uint32 number = 0;
    sint32 integer = 0;

    /// `name {"member":"value"}` of each call, in order.
    std::vector<std::string> told() const
    {
        std::vector<std::string> result;
        for (const Call& call : calls)
            result.push_back(call.name + " " + compact(call.request));
        return result;
    }
    size_t count(const std::string& name) const
    {
        size_t n = 0;
        for (const Call& call : calls)
            n += call.name == name;
        return n;
    }

    /// A list of adapters: what `getAllAdaptersIndexString` answers, and per address what `getHbaByWwn` does.
    void adapters(const std::vector<std::pair<std::string, Json::Value>>& details)
    {
        Json::Value list(Json::objectValue);
        list["indexStrings"] = Json::arrayValue;
        std::map<std::string, Json::Value> by_address;
        for (const auto& [address, answer] : details) {
            list["indexStrings"].append(address);
            by_address[address] = answer;
        }
        answers("getAllAdaptersIndexString", list);
        answers("getHbaByWwn", [by_address](const Json::Value& request) {
            const char* key = request.isMember("mac") ? "mac" : "wwn";
            const auto found = by_address.find(request[key].asString());
            return found == by_address.end() ? Json::Value() : found->second;
        });
    }

private:
    static Fake_Library*& current()
    {
        static Fake_Library* library = nullptr;
        return library;
    }
    Json::Value answer(const char* symbol, const Json::Value& request)
    {
        Answer answer;
        {
            const std::lock_guard lock(_mutex);
            calls.push_back({symbol, request});
            const auto found = _answers.find(symbol);
            if (found != _answers.end())
                answer = found->second;
        }
        return answer ? answer(request) : Json::Value();
    }
    template <class Result>
    static Result plain(const char* symbol, Result Fake_Library::*member)
    {
        current()->calls.push_back({symbol, {}});
        return current()->*member;
    }

#define ENTRY_POINT(symbol, variable, signature) static constexpr char name_of_##symbol[] = #symbol;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT

    template <const char* NAME>
    static void stand_in(JsonReqFP& variable)
    {
        variable = [](const Json::Value& request) { return current()->answer(NAME, request); };
    }
    template <const char* NAME>
    static void stand_in(voidRetStrFP& variable)
    {
        variable = [] { return plain(NAME, &Fake_Library::version); };
    }
    template <const char* NAME>
    static void stand_in(voidRetUIntFP& variable)
    {
        variable = [] { return plain(NAME, &Fake_Library::number); };
    }
    template <const char* NAME>
    static void stand_in(voidRetIntFP& variable)
    {
        variable = [] { return plain(NAME, &Fake_Library::integer); };
    }
    template <const char* NAME>
    static void stand_in(evtProcessCBRetVoidFP& variable)
    {
        variable = [](evtProcessCB callback) {
            current()->calls.push_back({NAME, callback != nullptr});
            current()->event_callback = callback;
            if (current()->on_event_callback)
                current()->on_event_callback();
        };
    }
    template <const char* NAME>
    static void stand_in(log4cxxMsgRetVoidFP& variable)
    {
        variable = [](log4cxxMsgCB) { current()->calls.push_back({NAME, {}}); };
    }

    std::mutex _mutex;
    std::map<std::string, Answer> _answers;
};

} // namespace KPRV
