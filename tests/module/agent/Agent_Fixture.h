#pragma once

#include "module/agent/JsonRpcManager.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {

/// The agent over a scripted adapter library.
class Agent_Fixture : public ::testing::Test
{
protected:
    static JsonRpcManager::response process(const std::string& request)
    {
        JsonRpcManager::response reply;
        JsonRpcManager::instance()->process(request, reply);
        return reply;
    }
    /// The text of a reply that is JSON.
    static std::string reply_text(const std::string& request)
    {
        const JsonRpcManager::response reply = process(request);
        EXPECT_EQ(200, reply.status) << reply.text;
        return reply.text;
    }
    /// The reply to a call; `params` as in `json()`.
    static Json::Value call_with(const std::string& method, const Json::Value& params)
    {
        Json::Value request;
        request["method"] = method;
        request["params"] = params;
        Json::Value reply = json(reply_text(compact(request)));
        EXPECT_EQ("1.1", reply["version"].asString());
        EXPECT_FALSE(reply.isMember("id"));
        EXPECT_NE(reply.isMember("result"), reply.isMember("error")) << compact(reply);
        return reply;
    }
    static Json::Value call(const std::string& method, const std::string& params)
    {
        return call_with(method, json(params));
    }
    /// What a call gives if it succeeds, in one line; the whole reply if not.
    static std::string result(const std::string& method, const std::string& params)
    {
        const Json::Value reply = call(method, params);
        return compact(reply.isMember("result") ? reply["result"] : reply);
    }
    /// What a call gives if it fails, as "name code message" for the three-member object.
    static std::string error_with(const std::string& method, const Json::Value& params)
    {
        const Json::Value reply = call_with(method, params);
        const Json::Value& error = reply["error"];
        if (error.size() != 3 || !error.isMember("name"))
            return compact(reply);
        return error["name"].asString() + " " + error["code"].asString() + " " + error["message"].asString();
    }
    static std::string error(const std::string& method, const std::string& params)
    {
        return error_with(method, json(params));
    }

    static constexpr const char* MISMATCH = "USERDEFINEDError 51 Mismatch in number of parameters.";
    static constexpr const char* NO_ARRAY = "USERDEFINEDError 54 Not a JSON array format.";
    static constexpr const char* NO_OBJECT = "USERDEFINEDError 55 Not a JSON Object format.";
    static constexpr const char* NO_STRING = "JSONRPCError 200 Type is not convertible to string";
    static constexpr const char* NO_INT = "JSONRPCError 200 Type is not convertible to int";
    /// The JSON library's own words for an element or a member of what has none.
    static constexpr const char* NOT_INDEXED =
        "JSONRPCError 200 in Json::Value::operator[](ArrayIndex)const: requires arrayValue";
    static constexpr const char* NO_MEMBERS =
        "JSONRPCError 200 in Json::Value::find(begin, end): requires objectValue or nullValue";

    Fake_Library library;
};

} // namespace KPRV
