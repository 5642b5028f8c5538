#include "module/runtime/objects/put_property_from_str.h"

#include "module/runtime/ground/Property.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/features.h"
#include "module/runtime/text/number_text.h"

namespace KPRV {

namespace {

// clang-format off
int parse(const char* text, boolean& x)  { return str_to_boolean(text, x); }
int parse(const char* text, uint8& x)    { return str_to_uint8(text, x); }
int parse(const char* text, sint8& x)    { return str_to_sint8(text, x); }
int parse(const char* text, uint16& x)   { return str_to_uint16(text, x); }
int parse(const char* text, sint16& x)   { return str_to_sint16(text, x); }
int parse(const char* text, uint32& x)   { return str_to_uint32(text, x); }
int parse(const char* text, sint32& x)   { return str_to_sint32(text, x); }
int parse(const char* text, uint64& x)   { return str_to_uint64(text, x); }
int parse(const char* text, sint64& x)   { return str_to_sint64(text, x); }
int parse(const char* text, real32& x)   { return str_to_real32(text, x); }
int parse(const char* text, real64& x)   { return str_to_real64(text, x); }
int parse(const char* text, char16& x)   { x = static_cast<char16>(static_cast<signed char>(*text)); return 0; }
int parse(const char* text, String& x)   { x = text; return 0; }
int parse(const char* text, Datetime& x) { return x.set(text) ? 0 : -1; }
// clang-format on

} // namespace

int __put_property_from_str(Instance* instance, const Meta_Property* meta_property, const char* text)
{
    return visit_type(static_cast<Type>(meta_property->type), [=](auto tag) {
        using T = typename decltype(tag)::type;
        T value = {};
        const int status = parse(text, value);
        if (meta_property->subscript) {
            auto& cell = cell_at<Property<Array<T>>>(instance, meta_property->offset);
            cell.null = 0;
            if (status == 0)
                cell.value.append(value);
        } else {
            auto& cell = cell_at<Property<T>>(instance, meta_property->offset);
            cell.null = 0;
            if (status == 0)
                cell.value = value;
        }
        return status;
    });
}

} // namespace KPRV
