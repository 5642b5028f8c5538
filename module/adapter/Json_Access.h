#pragma once

#include <json/value.h>

#include <algorithm>
#include <array>
#include <optional>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace KPRV {

// The one place where JSON values are taken apart. The installed JSON library counts null neither as an array
// nor as an object, turns numbers into texts without a word and fails in words of its own; callers and
// clients rely on the rules below instead. Nothing else calls `Json::Value::as*`.

/// A value of the wrong type. `what()` is "Type is not convertible to string", "... to int" or "... to uint".
struct Not_Convertible : std::runtime_error
{
    using std::runtime_error::runtime_error;
};

/// True for an array and for null.
bool isArrayOrNull(const Json::Value& value);
/// True for an object and for null.
bool isObjectOrNull(const Json::Value& value);

// Conversions. Null gives "", 0 and false; a boolean gives "true" or "false", 1 or 0. A string is no number
// and a number no string; a number that does not fit, and every other mismatch, throws `Not_Convertible`.

std::string asString(const Json::Value& value);
/// The same text into `to`; what `value` holds then is no matter. A text is not copied.
void take_text(Json::Value& value, Json::Value& to);
/// The same text where it stands, as long as the value stands.
std::string_view asView(const Json::Value& value);
/// Throws where `asView` would.
void expectText(const Json::Value& value);
/// A fraction is cut off.
int asInt(const Json::Value& value);
/// A fraction is cut off.
unsigned asUInt(const Json::Value& value);
/// Never throws: a number is true unless 0; a string, an array or an object is true unless empty.
bool asBool(const Json::Value& value);

/// True if the value is an object that has the member, whatever the member holds.
bool hasMember(const Json::Value& object, const char* name);
/// The member, or null if it is absent or the value is no object. Never adds a member.
const Json::Value& member(const Json::Value& object, const char* name);
/// The member, or a null pointer if it is absent or the value is no object.
const Json::Value* find_member(const Json::Value& object, const char* name);
inline Json::Value* find_member(Json::Value& object, const char* name)
{
    return const_cast<Json::Value*>(find_member(std::as_const(object), name));
}
/// Several members of one object in one pass over it, which is cheaper than to look each of them up. `names`
/// are in ascending order of their bytes; a null pointer in `found` stands for an absent member.
void find_members(const Json::Value& object, std::span<const std::string_view> names,
                  const Json::Value** found);

/// What is read of one kind of object, by the places of the names.
template <size_t N>
class Members
{
public:
    using Names = std::array<std::string_view, N>;

    /// The names are a constant: they must be in ascending order.
    Members(const Json::Value& object, const Names& names) { find_members(object, names, _found); }

    /// The member, or null if it is absent.
    const Json::Value& operator[](size_t place) const
    {
        return _found[place] ? *_found[place] : Json::Value::nullSingleton();
    }
    bool has(size_t place) const { return _found[place] != nullptr; }

private:
    const Json::Value* _found[N];
};

/// What is read of one kind of answer of the library; as long as the answer stands. `NAMES` has "error".
template <const auto& NAMES>
class Answer_Members : public Members<NAMES.size()>
{
public:
    explicit Answer_Members(const Json::Value& answer)
        : Members<NAMES.size()>(answer, NAMES), _is_null(answer.isNull())
    {
    }

    /// As `ProviderUtil::isValidJsonResponse` has it.
    bool is_valid() const { return !_is_null && !this->has(ERROR); }

private:
    static constexpr size_t ERROR = size_t(std::ranges::find(NAMES, "error") - NAMES.begin());
    static_assert(ERROR < NAMES.size() && std::ranges::is_sorted(NAMES));

    bool _is_null;
};

/// Element of an array, or null beyond its end.
const Json::Value& element(const Json::Value& array, unsigned index);

/// The elements of an array (or null) one after another, by their places: an array may have holes, which
/// count and give null.
class Element_Walk
{
public:
    explicit Element_Walk(Json::Value& array) : _next(array.begin()), _size(array.size()) {}

    /// The next element, or null that is the walk's own.
    Json::Value& next();

private:
    Json::Value::iterator _next;
    unsigned _size;
    unsigned _place = 0;
    std::optional<Json::Value> _hole;
};

} // namespace KPRV
