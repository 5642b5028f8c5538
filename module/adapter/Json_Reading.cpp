#include "module/adapter/Json_Reading.h"

#include <json/reader.h>

#include <algorithm>

namespace KPRV {

namespace {

using Position = std::string_view::size_type;

/// Behind the string that begins at the quote.
Position skip_string(std::string_view text, Position quote)
{
    Position at = quote + 1;
    while (at < text.size() && text[at] != '"')
        at += text[at] == '\\' ? 2 : 1;
    return at + 1;
}

/// Behind the comment that begins at the slash. A lone slash takes the next character with it, as it does in
/// the reader: a quote there begins no string.
Position skip_comment(std::string_view text, Position slash)
{
    const std::string_view head = text.substr(slash, 2);
    if (head != "/*" && head != "//")
        return slash + 2;
    const bool block = head == "/*";
    const Position end = block ? text.find("*/", slash + 2) : text.find_first_of("\r\n", slash);
    return end == text.npos ? text.size() : end + (block ? 2 : 1);
}

/// As deep as the reader would go, or deeper: brackets that it does not reach count too.
bool is_nested_too_deep(std::string_view text)
{
    unsigned depth = 0;
    for (Position at = 0; at < text.size();) {
        switch (text[at]) {
        case '"':
            at = skip_string(text, at);
            continue;
        case '/':
            at = skip_comment(text, at);
            continue;
        case '[':
        case '{':
            if (++depth > MOST_NESTED)
                return true;
            break;
        case ']':
        case '}':
            depth = std::max(depth, 1U) - 1;
            break;
        default:
            break;
        }
        ++at;
    }
    return false;
}

} // namespace

bool read_json(std::string_view text, Json::Value& value, std::string& errors)
{
    Json::Reader reader;
    return read_json(reader, text, value, errors);
}

bool read_json(Json::Reader& reader, std::string_view text, Json::Value& value, std::string& errors)
{
    // Either way (boundary): so many brackets are not too many.
    if (text.size() > MOST_NESTED && is_nested_too_deep(text)) {
        errors = "nested deeper than " + std::to_string(MOST_NESTED) + " levels";
        return false;
    }
    try {
        if (reader.parse(text.data(), text.data() + text.size(), value, true))
            return true;
        errors = reader.getFormattedErrorMessages();
    } catch (const Json::Exception& error) {
        errors = error.what();
    }
    return false;
}

} // namespace KPRV
