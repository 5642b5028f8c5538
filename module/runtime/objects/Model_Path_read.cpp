// Of `Model_Path`, from text to the instance that has its keys.
#include "module/runtime/objects/Model_Path.h"

#include "module/runtime/ground/strutil.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/features.h"

#include <cstdlib>
#include <cstring>
#include <type_traits>

namespace KPRV {

namespace {

bool begins_name(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

bool ends_value(char c)
{
    return c == '\0' || c == ',';
}

/// Reads its way through a text. What returns a bool says whether the text had the form.
class Reader
{
public:
    explicit Reader(const char* text) : _at(text) {}

    bool done() const { return *_at == '\0'; }

    bool accept(char c)
    {
        if (*_at != c)
            return false;
        _at++;
        return true;
    }

    bool name(String& out)
    {
        const char* start = _at;
        if (!begins_name(*_at))
            return false;
        while (begins_name(*_at) || (*_at >= '0' && *_at <= '9'))
            _at++;
        out.assign(start, static_cast<size_t>(_at - start));
        return true;
    }

    /// A backslash may stand before a double quote or a backslash, and nowhere else.
    bool string_literal(String& out)
    {
        if (!accept('"'))
            return false;
        out.clear();
        while (!accept('"')) {
            if (accept('\\') && *_at != '"' && *_at != '\\')
                return false;
            if (done())
                return false;
            out.append(*_at++);
        }
        return true;
    }

    /// A number is cut to the width of its property without a look at its range, and no digits at all are 0.
    bool integer(long long& out)
    {
        char* end = nullptr;
        out = strtoll(_at, &end, 10);
        if (!ends_value(*end))
            out = strtoll(_at, &end, 16);
        if (!ends_value(*end))
            return false;
        _at = end;
        return true;
    }

    bool boolean_word(bool& out)
    {
        const size_t size = strcspn(_at, ",");
        out = size == 4;
        if (size != 4 && size != 5)
            return false;
        if (!folded_eq(_at, out ? "true" : "false", size))
            return false;
        _at += size;
        return true;
    }

private:
    const char* _at;
};

template <class T>
bool read(Reader& reader, T& cell)
{
    if constexpr (std::is_same_v<T, boolean>) {
        return reader.boolean_word(cell);
    } else if constexpr (std::is_same_v<T, String>) {
        return reader.string_literal(cell);
    } else if constexpr (std::is_integral_v<T> && !std::is_same_v<T, char16>) {
        long long number = 0; // Either way (constant): it is read, or nobody looks at it.
        if (!reader.integer(number))
            return false;
        cell = static_cast<T>(number);
        return true;
    } else {
        // Reals, characters and datetimes have no place in a name.
        return false;
    }
}

bool read_reference(Reader& reader, const Meta_Class* target_class, Instance*& cell)
{
    String literal;
    if (!reader.string_literal(literal))
        return false;
    Instance* target = model_path_to_instance(target_class, literal.c_str());
    if (!target)
        return false;
    unref(cell);
    cell = target;
    return true;
}

bool read_value(Reader& reader, Instance* instance, const Meta_Feature* key)
{
    return visit_feature(
        key, Overloaded{
                 [&](Scalar_Feature f) {
                     return visit_type(f.type(), [&](auto tag) {
                         return read(reader, *static_cast<typename decltype(tag)::type*>(f.value(instance)));
                     });
                 },
                 [&](Reference_Feature f) {
                     return read_reference(reader, f.meta->meta_class, f.target(instance));
                 },
                 [](Array_Feature) { return false; },
                 [](Reference_Array_Feature) { return false; },
                 [](Method_Feature) { return false; },
             });
}

bool is_reference_array(const Meta_Feature* feature)
{
    return (feature->flags & FLAG_REFERENCE) && static_cast<const Meta_Reference*>(feature)->subscript != 0;
}

/// One binding and the comma behind it, if there is one.
bool read_binding(Reader& reader, Instance* instance)
{
    String name;
    if (!reader.name(name))
        return false;
    const Meta_Feature* key = find_feature(instance->__meta_class, name.c_str(), ANY_FEATURE);
    if (!key || !is_key(key) || !reader.accept('='))
        return false;
    // Written without a value and without a comma, and so read.
    if (is_reference_array(key))
        return true;
    if (!read_value(reader, instance, key))
        return false;
    reader.accept(',');
    return true;
}

} // namespace

Instance* model_path_to_instance(const Meta_Class* meta_class, const char* text)
{
    Reader reader(text);
    String name;
    if (!reader.name(name))
        return nullptr;
    const Meta_Class* found = find_meta_class(meta_class, name.c_str());
    if (!found || !reader.accept('.'))
        return nullptr;
    Ref<Instance> instance(create(found, false));
    __set_null_flags(instance.ptr(), false, true, 1);
    uint32 bindings = 0;
    for (; !reader.done(); bindings++) {
        if (!read_binding(reader, instance.ptr()))
            return nullptr;
    }
    // The number alone is asked: a key given twice can stand in for another one, which is then zero.
    return bindings == found->num_keys ? instance.steal() : nullptr;
}

} // namespace KPRV
