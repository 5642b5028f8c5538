// Of `Model_Path`, from an instance to the text of its keys.
#include "module/runtime/objects/Model_Path.h"

#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/features.h"

#include <cinttypes>
#include <cstdio>

namespace KPRV {

namespace {

template <class T>
void append_number(String& text, const char* format, T x)
{
    // A real may have 308 digits before its point.
    char digits[352];
    snprintf(digits, sizeof digits, format, x);
    text.append(digits);
}

void append_quoted(String& text, const String& x)
{
    text.append('"');
    text.append(x);
    text.append('"');
}

// clang-format off
void append(String& text, boolean x)         { text.append(x ? "true" : "false"); }
void append(String& text, uint8 x)           { append_number(text, "%u", unsigned(x)); }
void append(String& text, uint16 x)          { append_number(text, "%u", unsigned(x)); }
void append(String& text, uint32 x)          { append_number(text, "%u", unsigned(x)); }
void append(String& text, sint8 x)           { append_number(text, "%d", int(x)); }
void append(String& text, sint16 x)          { append_number(text, "%d", int(x)); }
void append(String& text, sint32 x)          { append_number(text, "%d", int(x)); }
void append(String& text, uint64 x)          { append_number(text, "%" PRIu64, x); }
void append(String& text, sint64 x)          { append_number(text, "%" PRId64, x); }
void append(String& text, real32 x)          { append_number(text, "%f", double(x)); }
void append(String& text, real64 x)          { append_number(text, "%f", x); }
void append(String& text, char16 x)          { append_number(text, "'%c'", int(x)); }
// A client sees the value as it is; only names within names need their quotes told apart.
void append(String& text, const String& x)   { append_quoted(text, x); }
void append(String& text, const Datetime& x) { text.append(x.ascii()); }
// clang-format on

String with_quotes_escaped(const String& text)
{
    String result;
    result.reserve(text.size() + 8);
    for (const char* p = text.c_str(); *p; p++) {
        if (*p == '"')
            result.append('\\');
        result.append(*p);
    }
    return result;
}

/// What came of writing a key.
enum class Written
{
    FAILED,
    /// Its name stands there, without a value, a comma or a place in the count.
    NAME_ONLY,
    DONE,
};

Written append_value(String& text, const Instance* instance, const Meta_Feature* key)
{
    return visit_feature(
        key, Overloaded{
                 [&](Scalar_Feature f) {
                     if (f.null(instance))
                         return Written::FAILED;
                     visit_type(f.type(), [&](auto tag) {
                         append(text, *static_cast<const typename decltype(tag)::type*>(f.value(instance)));
                     });
                     return Written::DONE;
                 },
                 [](Array_Feature) { return Written::FAILED; },
                 [&](Reference_Feature f) {
                     String nested;
                     const Instance* target = f.target(instance);
                     if (!target || instance_to_model_path(target, nested) != 0)
                         return Written::FAILED;
                     append_quoted(text, with_quotes_escaped(nested));
                     return Written::DONE;
                 },
                 [](Reference_Array_Feature) { return Written::NAME_ONLY; },
                 [](Method_Feature) { return Written::FAILED; },
             });
}

} // namespace

int instance_to_model_path(const Instance* instance, String& text)
{
    text.clear();
    const Meta_Class* meta_class = instance->__meta_class;
    if (meta_class->num_keys == 0)
        return -1;
    text.append(meta_class->name);
    text.append('.');
    uint32 written = 0;
    for (const Meta_Feature* feature : features_of(meta_class)) {
        if (!is_key(feature))
            continue;
        text.append(feature->name);
        text.append('=');
        const Written result = append_value(text, instance, feature);
        if (result == Written::FAILED)
            return -1;
        if (result == Written::DONE && ++written < meta_class->num_keys)
            text.append(',');
    }
    return 0;
}

} // namespace KPRV
