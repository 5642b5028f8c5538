#pragma once

#include <cstddef>
#include <json/json.h>
#include <stdexcept>
#include <string>

namespace KPRV::simulator {

/// Why a text was refused. `what()` is the whole line that a person needs: "NAME:LINE: REASON".
struct Refused : std::runtime_error
{
    using std::runtime_error::runtime_error;
};

/// A text of JSON that knows on which line each of its values stands.
class Json_Text
{
public:
    /// `name` is what refusals call the text, such as its file's name.
    Json_Text(std::string name, std::string text);

    /// The whole text of a file. Throws Refused, with line 0, if the file cannot be read.
    static Json_Text of_file(const std::string& path);

    /// The text's one value, whose parts keep their offsets. Comments are allowed; a member named
    /// twice, text behind the value and nesting beyond 64 levels are not. Throws Refused.
    Json::Value parse() const;

    /// Throws Refused, naming the line of `value`, which must come from parse() of this text.
    [[noreturn]] void refuse(const Json::Value& value, const std::string& reason) const;

private:
    [[noreturn]] void refuse_line(std::size_t line, const std::string& reason) const;
    std::size_t line_at(std::size_t offset) const;
    void check_nesting() const;

    std::string _name;
    std::string _text;
};

/// `value` as JSON text in one line.
std::string compact_text(const Json::Value& value);

} // namespace KPRV::simulator
