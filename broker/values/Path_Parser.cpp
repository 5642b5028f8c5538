#include "broker/values/Path_Parser.h"

#include <charconv>

namespace KPRV::broker {

namespace {

bool is_name_start(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}
bool is_digit(char c)
{
    return c >= '0' && c <= '9';
}

/// Cursor over the text; the first failure is kept.
class Path_Parser
{
public:
    Path_Parser(std::string_view text, Path_Error& error) : _text(text), _error(error) {}

    std::optional<Path_Value> parse()
    {
        Path_Value path;
        std::size_t colon = find_outside_keys(':');
        if (colon != std::string_view::npos) {
            path.name_space = _text.substr(0, colon);
            if (path.name_space.empty())
                return fail("a namespace before the colon");
            _at = colon + 1;
        }
        if (!name(path.class_name))
            return fail("a class name");
        if (_at == _text.size())
            return path;
        if (_text[_at] != '.')
            return fail("'.' and a key, or the end");
        do {
            ++_at;
            Named_Value key;
            if (!name(key.name))
                return fail("a key name");
            if (path.key(key.name))
                return fail("a key that has not been given before");
            if (_at == _text.size() || _text[_at] != '=')
                return fail("'='");
            ++_at;
            if (!value(key.value))
                return std::nullopt;
            path.keys.push_back(std::move(key));
        } while (_at < _text.size() && _text[_at] == ',');
        if (_at != _text.size())
            return fail("',' or the end");
        return path;
    }

private:
    std::nullopt_t fail(const char* expected)
    {
        _error = {_at + 1, expected};
        return std::nullopt;
    }

    /// A colon or the like that stands before the first key.
    std::size_t find_outside_keys(char c) const
    {
        std::size_t at = _text.find_first_of(std::string("=\"") + c);
        return at != std::string_view::npos && _text[at] == c ? at : std::string_view::npos;
    }

    bool name(std::string& result)
    {
        std::size_t start = _at;
        while (_at < _text.size() && (is_name_start(_text[_at]) || (_at > start && is_digit(_text[_at]))))
            ++_at;
        result = _text.substr(start, _at - start);
        return !result.empty();
    }

    bool value(Plain_Value& result)
    {
        if (_at == _text.size())
            return fail_value();
        if (_text[_at] == '"')
            return quoted_text(result);
        if (_text[_at] == '-' || is_digit(_text[_at]))
            return number(result);
        std::size_t start = _at;
        std::string word;
        name(word);
        if (same_name(word, "true") || same_name(word, "false")) {
            result = Plain_Value::boolean(same_name(word, "true"));
            return true;
        }
        _at = start;
        return fail_value();
    }

    bool fail_value()
    {
        fail("a quoted text, a number, true or false");
        return false;
    }

    bool number(Plain_Value& result)
    {
        const char *from = _text.data() + _at, *end = _text.data() + _text.size();
        std::from_chars_result read;
        if (*from == '-') {
            std::int64_t number = 0;
            read = std::from_chars(from, end, number);
            result = Plain_Value::signed_number(CMPI_sint64, number);
        } else {
            std::uint64_t number = 0;
            read = std::from_chars(from, end, number);
            result = Plain_Value::unsigned_number(CMPI_uint64, number);
        }
        if (read.ec != std::errc()) {
            fail("a number of at most 64 bits");
            return false;
        }
        _at = static_cast<std::size_t>(read.ptr - _text.data());
        return true;
    }

    bool quoted_text(Plain_Value& result)
    {
        std::string text;
        for (++_at; _at < _text.size() && _text[_at] != '"'; ++_at) {
            if (_text[_at] != '\\')
                text += _text[_at];
            else if (!escape(text))
                return false;
        }
        if (_at == _text.size()) {
            fail("'\"' at the end of the text");
            return false;
        }
        ++_at;
        result = Plain_Value::text(std::move(text));
        return true;
    }

    /// Leaves the cursor on the last character of the escape.
    bool escape(std::string& text)
    {
        static constexpr std::string_view letters = "\"\\ntrbf'", meanings = "\"\\\n\t\r\b\f'";
        ++_at;
        if (_at < _text.size()) {
            if (std::size_t which = letters.find(_text[_at]); which != std::string_view::npos) {
                text += meanings[which];
                return true;
            }
            unsigned code = 0;
            const char* from = _text.data() + _at + 1;
            if (_text[_at] == 'x' && _text.size() - _at > 4 &&
                std::from_chars(from, from + 4, code, 16).ptr == from + 4 && code > 0 && code < 0x100) {
                if (code >= 0x80)
                    text += static_cast<char>(0xC0 | code >> 6);
                text += static_cast<char>(code < 0x80 ? code : 0x80 | (code & 0x3F));
                _at += 4;
                return true;
            }
        }
        fail("an escape: \\\" \\\\ \\n \\t \\r \\b \\f or \\x and four digits");
        return false;
    }

    std::string_view _text;
    Path_Error& _error;
    std::size_t _at = 0;
};

} // namespace

std::optional<Path_Value> parse_path(std::string_view text, Path_Error& error)
{
    return Path_Parser(text, error).parse();
}

} // namespace KPRV::broker
