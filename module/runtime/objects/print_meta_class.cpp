#include "module/runtime/objects/print_meta_class.h"

#include "module/runtime/objects/features.h"
#include "module/runtime/objects/print_scalar.h"
#include "module/runtime/system/assert.h"
#include "module/runtime/text/formatted_text.h"

namespace KPRV {

namespace {

/// Where a record stands decides which flags it has by default.
enum class Place
{
    CLASS,
    FEATURE,
    PARAMETER,
};

/// A list in brackets that comes to be with its first element and ends its line.
class Bracketed_List
{
public:
    Bracketed_List(FILE* file, size_t level) : _file(file), _level(level) {}
    ~Bracketed_List()
    {
        if (!_empty)
            fputs("]\n", _file);
    }
    Bracketed_List(const Bracketed_List&) = delete;
    Bracketed_List& operator=(const Bracketed_List&) = delete;

    FILE* next()
    {
        if (_empty)
            ifprintf(_file, _level, "[");
        else
            fputs(", ", _file);
        _empty = false;
        return _file;
    }

private:
    FILE* _file;
    size_t _level;
    bool _empty = true;
};

void list_qualifiers(FILE* file, const Meta_Qualified_Object* object, Place place, size_t level)
{
    Bracketed_List list(file, level);
    constexpr uint32 FIRST_QUALIFIER = 4;
    for (uint32 i = FIRST_QUALIFIER; i < num_flag_names; i++) {
        const uint32 flag = 1u << i;
        const bool has = (object->flags & flag) != 0;
        // Two are true by default, each where it applies, so that only their absence tells something.
        if (flag == FLAG_IN || flag == FLAG_READ) {
            if (!has && place == (flag == FLAG_IN ? Place::PARAMETER : Place::FEATURE))
                fprintf(list.next(), "%s(False)", flag_names[i]);
        } else if (has) {
            fputs(flag_names[i], list.next());
        }
    }
    for (uint32 i = 0; i < object->num_meta_qualifiers; i++) {
        if (flag_name_to_index(object->meta_qualifiers[i]->name) < 0)
            fprint(list.next(), object->meta_qualifiers[i]);
    }
}

/// A record's name with the brackets of an array.
void print_name(FILE* file, const char* name, sint16 subscript)
{
    if (subscript > 0)
        fprintf(file, "%s[%d]", name, subscript);
    else
        fprintf(file, "%s%s", name, subscript ? "[]" : "");
}

void print_feature(FILE* file, const Meta_Feature* feature, Place place, size_t level, bool print_qualifiers);

void print_property(FILE* file, const Meta_Property* property, size_t level)
{
    ifprintf(file, level, "%s ", type_name[property->type]);
    print_name(file, property->name, property->subscript);
    fputs(" = ", file);
    if (!property->value) {
        fputs("NULL", file);
    } else if (property->subscript) {
        fputs("{ ", file);
        fprint_array(file, *property->value, static_cast<Type>(property->type));
        fputs(" }", file);
    } else {
        fprint_scalar(file, *property->value, static_cast<Type>(property->type));
    }
}

void print_reference(FILE* file, const Meta_Reference* reference, size_t level)
{
    ifprintf(file, level, "%s ref ", reference->meta_class->name);
    print_name(file, reference->name, reference->subscript);
}

void print_method(FILE* file, const Meta_Method* mm, size_t level, bool print_qualifiers)
{
    CIMPLE_ASSERT(mm->num_meta_features > 0);
    ifprintf(file, level, "%s %s(", type_name[mm->return_type], mm->name);
    // The last one is the return value.
    const uint32 parameters = mm->num_meta_features - 1;
    for (uint32 i = 0; i < parameters; i++) {
        fputs(i ? ",\n" : "\n", file);
        print_feature(file, mm->meta_features[i], Place::PARAMETER, level + 1, print_qualifiers);
    }
    fputs(")", file);
}

void print_feature(FILE* file, const Meta_Feature* feature, Place place, size_t level, bool print_qualifiers)
{
    const bool is_method = (feature->flags & FLAG_METHOD) != 0;
    if (print_qualifiers)
        list_qualifiers(file, feature, is_method ? Place::CLASS : place, level);
    if (feature->flags & FLAG_PROPERTY)
        print_property(file, static_cast<const Meta_Property*>(feature), level);
    else if (feature->flags & FLAG_REFERENCE)
        print_reference(file, static_cast<const Meta_Reference*>(feature), level);
    else
        print_method(file, static_cast<const Meta_Method*>(feature), level, print_qualifiers);
}

} // namespace

void fprint(FILE* file, const Meta_Class* meta_class, bool print_qualifiers, bool local_only)
{
    if (print_qualifiers)
        list_qualifiers(file, meta_class, Place::CLASS, 0);
    fprintf(file, "class %s", meta_class->name);
    if (meta_class->super_meta_class)
        fprintf(file, " : %s", meta_class->super_meta_class->name);
    fputs("\n{\n", file);
    for (uint32 i = 0; i < meta_class->num_meta_features; i++) {
        if (local_only && !(meta_class->locals && meta_class->locals[i]))
            continue;
        fprint(file, meta_class->meta_features[i], 1, print_qualifiers);
        fputs(";\n", file);
    }
    fputs("};\n", file);
}

void fprint(FILE* file, const Meta_Feature* meta_feature, size_t level, bool print_qualifiers)
{
    print_feature(file, meta_feature, Place::FEATURE, level, print_qualifiers);
}

void fprint(FILE* file, const Meta_Qualifier* meta_qualifier)
{
    const Type type = static_cast<Type>(meta_qualifier->type);
    const Meta_Value* value = meta_qualifier->value;
    fputs(meta_qualifier->name, file);
    if (!value)
        return;
    if (meta_qualifier->subscript) {
        fputs("{ ", file);
        fprint_array(file, *value, type);
        fputs(" }", file);
    } else if (type == BOOLEAN) {
        fputs(value->boolean_value ? "" : "(False)", file);
    } else {
        fputs("(", file);
        fprint_scalar(file, *value, type);
        fputs(")", file);
    }
}

void print(const Meta_Class* meta_class, bool print_qualifiers, bool local_only)
{
    fprint(stdout, meta_class, print_qualifiers, local_only);
}

void print(const Meta_Feature* meta_feature, size_t level, bool print_qualifiers)
{
    fprint(stdout, meta_feature, level, print_qualifiers);
}

void print(const Meta_Qualifier* meta_qualifier)
{
    fprint(stdout, meta_qualifier);
}

void dump(const Meta_Repository* repository)
{
    for (uint32 i = 0; i < repository->num_meta_classes; i++)
        print(repository->meta_classes[i], true, false);
}

} // namespace KPRV
