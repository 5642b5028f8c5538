#include "simulator/Json_Text.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <fstream>
#include <memory>
#include <sstream>
#include <system_error>

namespace KPRV::simulator {

namespace {

// The reader recurses, and the threads that come in through a CIM server have small stacks.
constexpr std::size_t MAX_NESTING = 64;

// The reader tells its first error as "* Line 3, Column 5\n  Missing ...\n".
struct Reader_Error
{
    std::size_t line = 1;
    std::string reason = "not JSON";
};

Reader_Error first_error(const std::string& errors)
{
    Reader_Error error;
    std::sscanf(errors.c_str(), "* Line %zu", &error.line);
    const std::size_t start = errors.find("\n  ");
    if (start != std::string::npos)
        error.reason = errors.substr(start + 3, errors.find('\n', start + 3) - start - 3);
    return error;
}

// Where a comment or a text that begins at `start` ends, or `start` if neither begins there.
std::size_t skip_opaque(const std::string& text, std::size_t start)
{
    if (text.compare(start, 2, "//") == 0)
        return std::min(text.find('\n', start), text.size());
    if (text.compare(start, 2, "/*") == 0)
        return std::min(text.find("*/", start + 2), text.size());
    if (text[start] != '"')
        return start;
    std::size_t end = start + 1;
    while (end < text.size() && text[end] != '"')
        end += text[end] == '\\' ? 2 : 1;
    return std::min(end, text.size());
}

} // namespace

Json_Text::Json_Text(std::string name, std::string text) : _name(std::move(name)), _text(std::move(text)) {}

Json_Text Json_Text::of_file(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    // An empty file gives nothing to insert, which counts as a failure of the insertion alone.
    if (file && (text << file.rdbuf() || file.peek() == std::ifstream::traits_type::eof()) && !file.bad())
        return {path, text.str()};
    throw Refused(path + ":0: cannot be read: " + std::generic_category().message(errno));
}

Json::Value Json_Text::parse() const
{
    check_nesting();
    Json::CharReaderBuilder builder;
    builder["collectComments"] = false;
    builder["failIfExtra"] = true;
    builder["rejectDupKeys"] = true;
    const std::unique_ptr<Json::CharReader> reader(builder.newCharReader());
    Json::Value value;
    std::string errors;
    const char* start = _text.data();
    if (!reader->parse(start, start + _text.size(), &value, &errors)) {
        const Reader_Error error = first_error(errors);
        refuse_line(error.line, error.reason);
    }
    return value;
}

void Json_Text::refuse(const Json::Value& value, const std::string& reason) const
{
    refuse_line(line_at(static_cast<std::size_t>(value.getOffsetStart())), reason);
}

void Json_Text::refuse_line(std::size_t line, const std::string& reason) const
{
    throw Refused(_name + ":" + std::to_string(line) + ": " + reason);
}

std::size_t Json_Text::line_at(std::size_t offset) const
{
    const char* start = _text.data();
    const char* end = start + std::min(offset, _text.size());
    return 1 + static_cast<std::size_t>(std::count(start, end, '\n'));
}

void Json_Text::check_nesting() const
{
    std::size_t depth = 0;
    for (std::size_t at = 0; at < _text.size(); ++at) {
        at = skip_opaque(_text, at);
        const char letter = at < _text.size() ? _text[at] : ' ';
        if (letter == '{' || letter == '[')
            ++depth;
        else if ((letter == '}' || letter == ']') && depth > 0)
            --depth;
        if (depth > MAX_NESTING)
            refuse_line(line_at(at), "nested deeper than 64 levels");
    }
}

std::string compact_text(const Json::Value& value)
{
    Json::StreamWriterBuilder builder;
    builder["indentation"] = "";
    return Json::writeString(builder, value);
}

} // namespace KPRV::simulator
