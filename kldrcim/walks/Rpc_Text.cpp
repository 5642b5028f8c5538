#include "kldrcim/walks/Rpc_Text.h"

#include "kldrcim/walks/Rpc_Methods.h"

#include <algorithm>
#include <memory>
#include <string_view>

namespace KPRV::kldrcim {

namespace {

/// False for what is not one JSON value and nothing else.
bool parse_json(const std::string& text, Json::Value& value)
{
    Json::CharReaderBuilder builder;
    builder["failIfExtra"] = true;
    builder["allowTrailingCommas"] = false;
    const std::unique_ptr<Json::CharReader> reader(builder.newCharReader());
    try {
        return reader->parse(text.data(), text.data() + text.size(), &value, nullptr);
    } catch (const std::exception&) { // nested too deeply for the reader
        return false;
    }
}

std::string json_lines(const Json::Value& value, const char* indentation)
{
    Json::StreamWriterBuilder builder;
    builder["indentation"] = indentation;
    builder["emitUTF8"] = true;
    builder["enableYAMLCompatibility"] = true; // no blank before a colon
    return Json::writeString(builder, value);
}

/// Takes the digits at the front of the text; false if there are none.
bool take_digits(std::string_view& text)
{
    const std::size_t size = std::min(text.find_first_not_of("0123456789"), text.size());
    text.remove_prefix(size);
    return size > 0;
}

/// Takes one of the letters from the front of the text, if one stands there.
bool take_letter(std::string_view& text, std::string_view letters)
{
    const bool takes = !text.empty() && letters.find(text.front()) != std::string_view::npos;
    text.remove_prefix(takes);
    return takes;
}

/// The reader also takes a minus sign alone for a number.
bool is_json_number(std::string_view text)
{
    take_letter(text, "-");
    if (!take_letter(text, "0") && !take_digits(text))
        return false;
    if (take_letter(text, ".") && !take_digits(text))
        return false;
    if (take_letter(text, "eE")) {
        take_letter(text, "+-");
        if (!take_digits(text))
            return false;
    }
    return text.empty();
}

bool is_json_literal(const std::string& word)
{
    return word == "true" || word == "false" || word == "null" || is_json_number(word);
}

bool begins_with_any(const std::string& word, const char* letters)
{
    return !word.empty() && std::string(letters).find(word.front()) != std::string::npos;
}

bool read_word(const std::string& word, bool is_string, Json::Value& value, std::string& error)
{
    if (begins_with_any(word, "[{\"")) {
        if (parse_json(word, value))
            return true;
        error = "not JSON: " + word;
        return false;
    }
    if (is_string || !is_json_literal(word) || !parse_json(word, value))
        value = word;
    return true;
}

bool read_words(const std::string& method, const std::vector<std::string>& words, Json::Value& params,
                std::string& error)
{
    const Rpc_Method* known = find_rpc_method(method);
    for (std::size_t place = 0; place < words.size(); ++place) {
        const bool is_string =
            known && place < known->parameters.size() && known->parameters[place].type == Rpc_Type::STRING;
        if (!read_word(words[place], is_string, params.append(Json::Value()), error))
            return false;
    }
    return true;
}

/// The library may have put anything in place of an error object.
std::string error_text(const Json::Value& error)
{
    if (error.isObject() && error["code"].isInt() && error["message"].isString())
        return std::to_string(error["code"].asInt()) + " " + error["message"].asString();
    return json_lines(error, "");
}

} // namespace

std::optional<std::string> rpc_request(const std::string& method, const std::vector<std::string>& words,
                                       std::string& error)
{
    Json::Value request;
    request["version"] = "1.1";
    request["id"] = 1;
    request["method"] = method;
    Json::Value& params = request["params"] = Json::Value(Json::arrayValue);
    const bool whole = words.size() == 1 && begins_with_any(words[0], "[");
    const bool read =
        whole ? read_word(words[0], false, params, error) : read_words(method, words, params, error);
    if (!read)
        return std::nullopt;
    return json_lines(request, "");
}

Rpc_Reply read_rpc_reply(const std::string& text)
{
    Json::Value reply;
    if (!parse_json(text, reply) || !reply.isObject())
        return {"", text.empty() ? "an empty reply" : text};
    if (reply.isMember("error"))
        return {"", error_text(reply["error"])};
    return {json_lines(reply["result"], "  "), ""};
}

} // namespace KPRV::kldrcim
