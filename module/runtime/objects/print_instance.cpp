#include "module/runtime/objects/print_instance.h"

#include "module/runtime/objects/features.h"
#include "module/runtime/objects/print_scalar.h"

namespace KPRV {

namespace {

struct Printer
{
    FILE* file;
    uint32 level;
    bool keys_only;

    void indent(uint32 depth) const { fprintf(file, "%*s", static_cast<int>(4 * depth), ""); }

    /// At the top everything shows, below it what names or is the object.
    bool shows(const Meta_Feature* feature) const
    {
        return level == 0 ? !keys_only || is_key(feature)
                          : (feature->flags & (FLAG_KEY | FLAG_EMBEDDED)) != 0;
    }

    void record(const Instance* instance, const char* field) const
    {
        indent(level);
        if (field)
            fprintf(file, "%s %s =\n", instance->__meta_class->name, field);
        else
            fprintf(file, "%s\n", instance->__meta_class->name);
        indent(level);
        fputs("{\n", file);
        if (!instance->__name_space.empty()) {
            indent(level + 1);
            fprintf(file, "string __name_space = \"%s\";\n", instance->__name_space.c_str());
        }
        for (const Meta_Feature* feature : features_of(instance->__meta_class)) {
            if (shows(feature))
                this->feature(instance, feature);
        }
        indent(level);
        fputs("}\n", file);
    }

    void feature(const Instance* instance, const Meta_Feature* feature) const
    {
        const Printer inner = {file, level + 1, false};
        visit_feature(feature, Overloaded{
                                   [&](Scalar_Feature f) {
                                       inner.property_head(f.meta, "");
                                       if (f.null(instance))
                                           fputs("NULL", file);
                                       else
                                           fprint_scalar_value(file, f.type(), f.value(instance));
                                       fputs(";\n", file);
                                   },
                                   [&](Array_Feature f) {
                                       inner.property_head(f.meta, "[]");
                                       if (f.null(instance))
                                           fputs("NULL", file);
                                       else
                                           fprint_array_value(file, f.type(), f.array(instance));
                                       fputs(";\n", file);
                                   },
                                   [&](Reference_Feature f) {
                                       if (f.target(instance)) {
                                           inner.record(f.target(instance), f.meta->name);
                                           return;
                                       }
                                       inner.indent(inner.level);
                                       fprintf(file, "%s %s = NULL;\n", f.meta->meta_class->name,
                                               f.meta->name);
                                   },
                                   [&](Reference_Array_Feature f) { inner.references(instance, f); },
                                   [](Method_Feature) {},
                               });
    }

    void property_head(const Meta_Property* meta, const char* brackets) const
    {
        indent(level);
        fprintf(file, "%s %s%s = ", type_name[meta->type], meta->name, brackets);
    }

    void references(const Instance* instance, Reference_Array_Feature f) const
    {
        indent(level);
        fprintf(file, "%s %s[] =", f.meta->meta_class->name, f.meta->name);
        if (f.null(instance)) {
            fputs(" NULL;\n", file);
            return;
        }
        fputs("\n", file);
        indent(level);
        fputs("{\n", file);
        for (const Instance* target : f.targets(instance))
            fprint_nested(file, target, level + 1);
        indent(level);
        fputs("};\n", file);
    }
};

} // namespace

void fprint(FILE* file, const Instance* instance, bool keys_only)
{
    Printer{file, 0, keys_only}.record(instance, nullptr);
}

void print(const Instance* instance, bool keys_only)
{
    fprint(stdout, instance, keys_only);
}

void fprint_nested(FILE* file, const Instance* instance, uint32 level)
{
    const Printer printer = {file, level, false};
    if (instance) {
        printer.record(instance, nullptr);
        return;
    }
    printer.indent(level);
    fputs("NULL\n", file);
}

} // namespace KPRV
