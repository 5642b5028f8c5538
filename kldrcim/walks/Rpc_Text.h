#pragma once

#include <json/json.h>
#include <optional>
#include <string>
#include <vector>

namespace KPRV::kldrcim {

/// The text of a call of the agent's protocol. `words` are the parameters as people write them:
/// - one word that begins with "[" is the JSON array of all parameters;
/// - otherwise each word is one parameter: JSON if it begins with "[", "{" or a quote; a string where the
///   method's table says so; else the JSON value that it is, such as 7 or true, or else a string.
/// Nothing, with a one-line `error`, if what has to be JSON is none.
std::optional<std::string> rpc_request(const std::string& method, const std::vector<std::string>& words,
                                       std::string& error);

/// What a reply says.
struct Rpc_Reply
{
    /// JSON text, in lines; empty if the call failed.
    std::string result;
    /// "code message" of an error, or what came in place of a reply; empty if the call succeeded.
    std::string error;
};

Rpc_Reply read_rpc_reply(const std::string& text);

} // namespace KPRV::kldrcim
