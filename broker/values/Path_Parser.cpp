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
    Path_Parser(std::string_view text, Path_Error& error) : text_(text), error_(error) {}

    std::optional<Path_Value> parse()
    {
        Path_Value path;
        std::size_t colon = find_outside_keys(':');
        if (colon != std::string_view::npos) {
            path.name_space = text_.substr(0, colon);
            if (path.name_space.empty())
                return fail("a namespace before the colon");
            at_ = colon + 1;
        }
        if (!name(path.class_name))
            return fail("a class name");
        if (at_ == text_.size())
            return path;
        if (text_[at_] != '.')
            return fail("'.' and a key, or the end");
        do {
            ++at_;
            Named_Value key;
            if (!name(key.name))
                return fail("a key name");
            if (path.key(key.name))
                return fail("a key that has not been given before");
            if (at_ == text_.size() || text_[at_] != '=')
                return fail("'='");
            ++at_;
            if (!value(key.value))
                return std::nullopt;
            path.keys.push_back(std::move(key));
        } while (at_ < text_.size() && text_[at_] == ',');
        if (at_ != text_.size())
            return fail("',' or the end");
        return path;
    }

private:
    std::nullopt_t fail(const char* expected)
    {
        error_ = {at_ + 1, expected};
        return std::nullopt;
    }

    /// A colon or the like that stands before the first key.
    std::size_t find_outside_keys(char c) const
    {
        std::size_t at = text_.find_first_of(std::string("=\"") + c);
        return at != std::string_view::npos && text_[at] == c ? at : std::string_view::npos;
    }

    bool name(std::string& result)
    {
        std::size_t start = at_;
        while (at_ < text_.size() && (is_name_start(text_[at_]) || (at_ > start && is_digit(text_[at_]))))
            ++at_;
        result = text_.substr(start, at_ - start);
        return !result.empty();
    }

    bool value(Value& result)
    {
        if (at_ == text_.size())
            return fail_value();
        if (text_[at_] == '"')
            return quoted_text(result);
        if (text_[at_] == '-' || is_digit(text_[at_]))
            return number(result);
        std::size_t start = at_;
        std::string word;
        name(word);
        if (same_name(word, "true") || same_name(word, "false")) {
            result = Value::boolean(same_name(word, "true"));
            return true;
        }
        at_ = start;
        return fail_value();
    }

    bool fail_value()
    {
        fail("a quoted text, a number, true or false");
        return false;
    }

    bool number(Value& result)
    {
        const char *from = text_.data() + at_, *end = text_.data() + text_.size();
        std::from_chars_result read;
        if (*from == '-') {
            std::int64_t number = 0;
            read = std::from_chars(from, end, number);
            result = Value::signed_number(CMPI_sint64, number);
        } else {
            std::uint64_t number = 0;
            read = std::from_chars(from, end, number);
            result = Value::unsigned_number(CMPI_uint64, number);
        }
        if (read.ec != std::errc()) {
            fail("a number of at most 64 bits");
            return false;
        }
        at_ = static_cast<std::size_t>(read.ptr - text_.data());
        return true;
    }

    bool quoted_text(Value& result)
    {
        std::string text;
        for (++at_; at_ < text_.size() && text_[at_] != '"'; ++at_) {
            if (text_[at_] != '\\')
                text += text_[at_];
            else if (!escape(text))
                return false;
        }
        if (at_ == text_.size()) {
            fail("'\"' at the end of the text");
            return false;
        }
        ++at_;
        result = Value::text(std::move(text));
        return true;
    }

    /// Leaves the cursor on the last character of the escape.
    bool escape(std::string& text)
    {
        static constexpr std::string_view letters = "\"\\ntrbf'", meanings = "\"\\\n\t\r\b\f'";
        ++at_;
        if (at_ < text_.size()) {
            if (std::size_t which = letters.find(text_[at_]); which != std::string_view::npos) {
                text += meanings[which];
                return true;
            }
            unsigned code = 0;
            const char* from = text_.data() + at_ + 1;
            if (text_[at_] == 'x' && text_.size() - at_ > 4 &&
                std::from_chars(from, from + 4, code, 16).ptr == from + 4 && code > 0 && code < 0x80) {
                text += static_cast<char>(code);
                at_ += 4;
                return true;
            }
        }
        fail("an escape: \\\" \\\\ \\n \\t \\r \\b \\f or \\x and four digits");
        return false;
    }

    std::string_view text_;
    Path_Error& error_;
    std::size_t at_ = 0;
};

} // namespace

std::optional<Path_Value> parse_path(std::string_view text, Path_Error& error)
{
    return Path_Parser(text, error).parse();
}

} // namespace KPRV::broker
