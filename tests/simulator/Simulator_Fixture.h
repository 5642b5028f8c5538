#pragma once

#include "simulator/Simulator_Control.h"

#include <algorithm>
#include <cstdlib>
#include <gtest/gtest.h>
#include <json/json.h>
#include <memory>
#include <string>

namespace KPRV::simulator {

inline Json::Value parsed(const std::string& text)
{
    const std::unique_ptr<Json::CharReader> reader(Json::CharReaderBuilder().newCharReader());
    Json::Value value;
    std::string errors;
    if (!reader->parse(text.data(), text.data() + text.size(), &value, &errors))
        ADD_FAILURE() << text << "\n" << errors;
    return value;
}

/// JSON text as a value; single quotes stand for double ones, so that tests stay readable.
inline Json::Value json(std::string text)
{
    std::replace(text.begin(), text.end(), '\'', '"');
    return parsed(text);
}

/// A test that opens the built library and calls it as the module would.
class Simulator_Fixture : public testing::Test
{
protected:
    Simulator_Fixture() : simulator(SIMULATOR_LIBRARY)
    {
        unsetenv("KLDR_SIMULATOR_INVENTORY");
        simulator.reset();
        integer("free_hba_lib");
        simulator.clear_calls();
    }

    /// Calls a JSON entry point. The answer takes the way over text, since 1 and 1u do not compare equal.
    Json::Value call(const std::string& name, const Json::Value& request = {})
    {
        return parsed(Json::writeString(Json::StreamWriterBuilder(),
                                        simulator.symbol<Json::Value(const Json::Value&)>(name)(request)));
    }
    Json::Value call(const std::string& name, const char* request) { return call(name, json(request)); }

    int integer(const std::string& name) { return simulator.symbol<int()>(name)(); }
    const char* version() { return simulator.symbol<const char*()>("get_agt_version")(); }

    /// The `code` of an answer's "error", or 0.
    static int error_code(const Json::Value& answer) { return answer["error"]["code"].asInt(); }

    static std::string inventory(const std::string& name)
    {
        return std::string(SIMULATOR_INVENTORIES) + "/" + name;
    }

    Simulator_Control simulator;
};

} // namespace KPRV::simulator
