#include "kldrcim/server/Select_Query.h"

#include "broker/values/Type_Words.h"

#include <algorithm>
#include <charconv>

namespace KPRV::kldrcim {

namespace {

/// As in SQL: what is unknown stays unknown when it is negated.
enum class Truth
{
    NO,
    UNKNOWN,
    YES,
};

Truth truth_of(bool value)
{
    return value ? Truth::YES : Truth::NO;
}

/// Of parentheses and NOTs, each of which is a call.
constexpr unsigned DEEPEST_CONDITION = 64;
/// A chain of them is a tree as deep.
constexpr unsigned MOST_COMPARISONS = 256;

enum class Compare
{
    EQUAL,
    UNEQUAL,
    LESS,
    LESS_EQUAL,
    GREATER,
    GREATER_EQUAL,
    LIKE,
    IS_NULL,
    ISA,
};

constexpr std::pair<const char*, Compare> comparisons[] = {
    {"=", Compare::EQUAL},       {"<>", Compare::UNEQUAL},       {"!=", Compare::UNEQUAL},
    {"<=", Compare::LESS_EQUAL}, {">=", Compare::GREATER_EQUAL}, {"<", Compare::LESS},
    {">", Compare::GREATER},     {"LIKE", Compare::LIKE},        {"ISA", Compare::ISA},
};

/// % is any text, _ any one character.
bool is_like(std::string_view text, std::string_view pattern)
{
    std::size_t at = 0, in = 0, star = pattern.npos, resume = 0;
    while (at < text.size()) {
        if (in < pattern.size() && pattern[in] == '%') {
            star = in++;
            resume = at;
        } else if (in < pattern.size() && (pattern[in] == '_' || pattern[in] == text[at])) {
            ++in;
            ++at;
        } else if (star != pattern.npos) {
            in = star + 1;
            at = ++resume;
        } else {
            return false;
        }
    }
    return pattern.find_first_not_of('%', in) == pattern.npos;
}

/// Less than, equal, greater: -1, 0, 1. Nothing for two that cannot be compared.
std::optional<int> order(const Plain_Value& a, const Plain_Value& b)
{
    const auto sign = [](auto x, auto y) { return x < y ? -1 : x > y ? 1 : 0; };
    const auto is_text = [](const Plain_Value& value) {
        return value.type == CMPI_string || value.type == CMPI_dateTime;
    };
    if (is_text(a) && is_text(b))
        return sign(a.as_text().compare(b.as_text()), 0);
    if (a.type == CMPI_boolean && b.type == CMPI_boolean)
        return sign(a.as_bool(), b.as_bool());
    const bool numbers = (is_integer(a.type) || is_real(a.type)) && (is_integer(b.type) || is_real(b.type));
    if (!numbers)
        return std::nullopt;
    if (is_real(a.type) || is_real(b.type)) {
        const auto real = [](const Plain_Value& value) {
            return is_real(value.type)       ? value.as_real()
                   : is_unsigned(value.type) ? static_cast<double>(value.as_uint())
                                             : static_cast<double>(value.as_sint());
        };
        return sign(real(a), real(b));
    }
    const bool a_negative = is_signed(a.type) && a.as_sint() < 0,
               b_negative = is_signed(b.type) && b.as_sint() < 0;
    if (a_negative || b_negative)
        return a_negative && b_negative ? sign(a.as_sint(), b.as_sint()) : a_negative ? -1 : 1;
    return sign(a.as_uint(), b.as_uint());
}

} // namespace

/// A tree of AND, OR and NOT over comparisons.
class Select_Query::Condition
{
public:
    enum Kind
    {
        COMPARE,
        AND,
        OR,
        NOT,
    };

    Kind kind = COMPARE;
    /// The names on the way to a property: "SourceInstance", "OperationalStatus".
    std::vector<std::string> property;
    Compare comparison = Compare::EQUAL;
    Plain_Value value;
    std::shared_ptr<const Condition> left, right;

    Truth evaluate(const Instance_Value& instance, const Class_Catalogue& classes) const
    {
        if (kind == COMPARE)
            return compare(instance, classes);
        const Truth first = left->evaluate(instance, classes);
        if (kind == NOT)
            return first == Truth::YES ? Truth::NO : first == Truth::NO ? Truth::YES : Truth::UNKNOWN;
        const Truth second = right->evaluate(instance, classes);
        return kind == AND ? std::min(first, second) : std::max(first, second);
    }

private:
    Truth compare(const Instance_Value& instance, const Class_Catalogue& classes) const
    {
        const Instance_Value* holder = &instance;
        const Plain_Value* found = nullptr;
        for (std::size_t i = 0; i < property.size() && holder; ++i) {
            found = holder->property(property[i]);
            holder = found && !found->null ? found->as_instance() : nullptr;
        }
        const bool null = !found || found->null;
        if (comparison == Compare::IS_NULL)
            return truth_of(null);
        if (comparison == Compare::ISA)
            return null || !holder ? Truth::UNKNOWN
                                   : truth_of(classes.is_a(holder->path.class_name, value.as_text()));
        if (null || value.null)
            return Truth::UNKNOWN;
        if (comparison == Compare::LIKE)
            return found->type == CMPI_string ? truth_of(is_like(found->as_text(), value.as_text()))
                                              : Truth::UNKNOWN;
        const std::optional<int> ordered = order(*found, value);
        return ordered ? truth_of(holds(*ordered)) : Truth::UNKNOWN;
    }

    bool holds(int ordered) const
    {
        switch (comparison) {
        case Compare::EQUAL:
            return ordered == 0;
        case Compare::UNEQUAL:
            return ordered != 0;
        case Compare::LESS:
            return ordered < 0;
        case Compare::LESS_EQUAL:
            return ordered <= 0;
        case Compare::GREATER:
            return ordered > 0;
        default:
            return ordered >= 0;
        }
    }
};

class Query_Parser
{
public:
    explicit Query_Parser(const std::string& text) : _text(text) { advance(); }

    std::optional<Select_Query> query(Query_Error& error)
    {
        Select_Query result;
        if (select(result) && end()) {
            result._compared = std::move(_compared);
            return result;
        }
        error = {CMPI_RC_ERR_INVALID_QUERY,
                 "at character " + std::to_string(_failed_at + 1) + ": " + _wanted + " is expected"};
        return std::nullopt;
    }

private:
    using Condition = Select_Query::Condition;
    using Part = std::shared_ptr<const Condition>;

    enum class Kind
    {
        END,
        WORD,
        TEXT,
        NUMBER,
        SIGN,
        BROKEN,
    };

    bool select(Select_Query& result)
    {
        if (!word("SELECT") || !properties(result._properties) || !word("FROM") || !name(result._class_name))
            return false;
        // An alias, as in FROM Class AS c, is one thing more than alerts need.
        if (!is_word("WHERE"))
            return true;
        advance();
        result._condition = any_of(result._class_name);
        return result._condition != nullptr;
    }

    bool properties(std::vector<std::string>& names)
    {
        if (sign("*"))
            return true;
        do {
            if (!name(names.emplace_back()))
                return false;
        } while (sign(","));
        return true;
    }

    Part any_of(const std::string& class_name) { return chain(class_name, "OR", Condition::OR); }
    Part all_of(const std::string& class_name) { return chain(class_name, "AND", Condition::AND); }

    Part chain(const std::string& class_name, const char* between, Condition::Kind kind)
    {
        Part left = kind == Condition::OR ? all_of(class_name) : one(class_name);
        while (left && is_word(between)) {
            advance();
            Part right = kind == Condition::OR ? all_of(class_name) : one(class_name);
            left = right ? both(kind, left, right) : nullptr;
        }
        return left;
    }

    static Part both(Condition::Kind kind, Part left, Part right)
    {
        auto part = std::make_shared<Condition>();
        part->kind = kind;
        part->left = std::move(left);
        part->right = std::move(right);
        return part;
    }

    Part one(const std::string& class_name)
    {
        if (++_depth > DEEPEST_CONDITION)
            return fail("less nesting"), nullptr;
        Part part;
        if (is_word("NOT")) {
            advance();
            part = one(class_name);
            part = part ? both(Condition::NOT, part, nullptr) : nullptr;
        } else if (sign("(")) {
            part = any_of(class_name);
            if (part && !sign(")"))
                part = (fail("\")\""), nullptr);
        } else {
            part = comparison(class_name);
        }
        --_depth;
        return part;
    }

    Part comparison(const std::string& class_name)
    {
        if (++_comparisons > MOST_COMPARISONS)
            return fail("fewer comparisons"), nullptr;
        auto part = std::make_shared<Condition>();
        if (!path(class_name, part->property))
            return nullptr;
        if (is_word("IS"))
            return null_test(part);
        const auto* found = std::ranges::find_if(comparisons, [&](const auto& each) {
            return (_kind == Kind::SIGN || _kind == Kind::WORD) && same_name(_token, each.first);
        });
        if (found == std::end(comparisons))
            return fail("a comparison"), nullptr;
        advance();
        part->comparison = found->second;
        if (found->second == Compare::ISA) {
            std::string ancestor;
            if (_kind == Kind::TEXT)
                ancestor = _token, advance();
            else if (!name(ancestor))
                return nullptr;
            part->value = Plain_Value::text(ancestor);
            return part;
        }
        return literal(part->value) ? part : nullptr;
    }

    Part null_test(const std::shared_ptr<Condition>& part)
    {
        advance();
        const bool negated = is_word("NOT");
        if (negated)
            advance();
        if (!word("NULL"))
            return nullptr;
        part->comparison = Compare::IS_NULL;
        return negated ? both(Condition::NOT, part, nullptr) : part;
    }

    /// "Name", "Class.Name", "SourceInstance.Name", "SourceInstance.Class::Name".
    bool path(const std::string& class_name, std::vector<std::string>& names)
    {
        std::string part;
        if (!name(part))
            return false;
        names.push_back(part);
        for (;;) {
            const bool scope = sign("::");
            if (!scope && !sign("."))
                break;
            if (!name(part))
                return false;
            // A class in front of a property says where it was declared.
            if (scope)
                names.pop_back();
            names.push_back(part);
        }
        if (names.size() > 1 && same_name(names.front(), class_name))
            names.erase(names.begin());
        _compared.push_back(names.front());
        return names.size() <= 2 || fail("one embedded instance at most");
    }

    bool literal(Plain_Value& value)
    {
        if (_kind == Kind::TEXT)
            value = Plain_Value::text(_token);
        else if (_kind == Kind::NUMBER)
            return number(value);
        else if (is_word("TRUE") || is_word("FALSE"))
            value = Plain_Value::boolean(is_word("TRUE"));
        else if (is_word("NULL"))
            value = Plain_Value::null_of(CMPI_string);
        else
            return fail("a text, a number, TRUE, FALSE or NULL");
        advance();
        return true;
    }

    bool number(Plain_Value& value)
    {
        const char* end = _token.data() + _token.size();
        std::uint64_t magnitude = 0;
        std::int64_t negative = 0;
        double real = 0;
        if (const auto read = std::from_chars(_token.data(), end, magnitude);
            read.ec == std::errc() && read.ptr == end)
            value = Plain_Value::unsigned_number(CMPI_uint64, magnitude);
        else if (const auto less = std::from_chars(_token.data(), end, negative);
                 less.ec == std::errc() && less.ptr == end)
            value = Plain_Value::signed_number(CMPI_sint64, negative);
        else if (const auto point = std::from_chars(_token.data(), end, real);
                 point.ec == std::errc() && point.ptr == end)
            value = Plain_Value::real(CMPI_real64, real);
        else
            return fail("a number");
        advance();
        return true;
    }

    bool end() { return _kind == Kind::END || fail("AND, OR or the end"); }
    bool is_word(const char* wanted) const { return _kind == Kind::WORD && same_name(_token, wanted); }
    bool word(const char* wanted)
    {
        if (!is_word(wanted))
            return fail(wanted);
        advance();
        return true;
    }
    bool sign(std::string_view wanted)
    {
        if (_kind != Kind::SIGN || _token != wanted)
            return false;
        advance();
        return true;
    }
    bool name(std::string& result)
    {
        if (_kind != Kind::WORD)
            return fail("a name");
        result = _token;
        advance();
        return true;
    }
    bool fail(const char* wanted)
    {
        if (_wanted.empty()) {
            _wanted = wanted;
            _failed_at = _token_at;
        }
        return false;
    }

    void advance()
    {
        _at = std::min(_text.find_first_not_of(" \t\r\n", _at), _text.size());
        _token_at = _at;
        _token.clear();
        _kind = Kind::END;
        if (_at == _text.size())
            return;
        const char c = _text[_at];
        if (is_name_character(c) && !is_digit(c))
            return take(Kind::WORD, [](char each) { return is_name_character(each); });
        if (is_digit(c) || (c == '-' && _at + 1 < _text.size() && is_digit(_text[_at + 1])))
            return take(Kind::NUMBER,
                        [](char each) { return is_name_character(each) || each == '.' || each == '-'; });
        if (c == '\'' || c == '"')
            return quoted(c);
        constexpr std::string_view pairs[] = {"<>", "!=", "<=", ">=", "::"};
        const bool is_pair =
            std::ranges::find(pairs, std::string_view(_text).substr(_at, 2)) != std::end(pairs);
        _token = _text.substr(_at, is_pair ? 2 : 1);
        _at += _token.size();
        _kind = Kind::SIGN;
    }

    static bool is_digit(char c) { return c >= '0' && c <= '9'; }
    static bool is_name_character(char c)
    {
        const char lower = static_cast<char>(c | 0x20);
        return (lower >= 'a' && lower <= 'z') || is_digit(c) || c == '_' ||
               static_cast<unsigned char>(c) >= 0x80;
    }

    template <class Belongs>
    void take(Kind kind, Belongs belongs)
    {
        while (_at < _text.size() && belongs(_text[_at]))
            _token += _text[_at++];
        _kind = kind;
    }

    /// A quote in the text is doubled, or stands behind a backslash.
    void quoted(char quote)
    {
        for (++_at; _at < _text.size(); ++_at) {
            const bool more = _at + 1 < _text.size();
            if (_text[_at] == quote && !(more && _text[_at + 1] == quote)) {
                ++_at;
                _kind = Kind::TEXT;
                return;
            }
            if (more && (_text[_at] == quote || _text[_at] == '\\'))
                ++_at;
            _token += _text[_at];
        }
        _kind = Kind::BROKEN;
    }

    const std::string& _text;
    std::size_t _at = 0;
    std::size_t _token_at = 0;
    Kind _kind = Kind::END;
    std::string _token;
    unsigned _depth = 0;
    unsigned _comparisons = 0;
    std::vector<std::string> _compared;
    std::string _wanted;
    std::size_t _failed_at = 0;
};

std::optional<Select_Query> Select_Query::parse(const std::string& text, const std::string& language,
                                                Query_Error& error)
{
    constexpr const char* languages[] = {"WQL", "DMTF:CQL", "CIM:CQL", "CQL"};
    if (std::ranges::none_of(languages, [&](const char* each) { return same_name(each, language); })) {
        error = {CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "WQL and DMTF:CQL are understood"};
        return std::nullopt;
    }
    return Query_Parser(text).query(error);
}

std::string Select_Query::unknown_property(const Class_Info& info) const
{
    for (const auto* names : {&_properties, &_compared})
        for (const std::string& name : *names)
            if (!info.property(name))
                return name;
    return {};
}

bool Select_Query::matches(const Instance_Value& instance, const Class_Catalogue& classes) const
{
    return classes.is_a(instance.path.class_name, _class_name) &&
           (!_condition || _condition->evaluate(instance, classes) == Truth::YES);
}

void Select_Query::project(Instance_Value& instance) const
{
    if (_properties.empty())
        return;
    std::erase_if(instance.properties, [&](const Named_Value& property) {
        return !same_name(property.name, "SequenceContext") && !same_name(property.name, "SequenceNumber") &&
               std::ranges::none_of(_properties,
                                    [&](const std::string& name) { return same_name(name, property.name); });
    });
}

} // namespace KPRV::kldrcim
