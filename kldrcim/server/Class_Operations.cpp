// Classes and qualifiers, out of the catalogue.
#include "kldrcim/server/Cim_Server.h"

#include "kldrcim/wire/Class_Xml.h"
#include "kldrcim/wire/Qualifiers.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

Class_Form class_form(const Operation_Call& call)
{
    Class_Form form;
    form.local_only = call.parameters.flag("LocalOnly", true);
    form.qualifiers = call.parameters.flag("IncludeQualifiers", true);
    form.origins = call.parameters.flag("IncludeClassOrigin", false);
    return form;
}

Result get_class(const Operation_Call& call)
{
    const std::string name = call.parameters.required_class_name("ClassName");
    Class_Form form = class_form(call);
    form.properties = call.parameters.names("PropertyList");
    const Class_Info* info = call.space.classes().find(name);
    if (!info)
        return failed(CMPI_RC_ERR_NOT_FOUND, name);
    write_class(call.answer.object(), call.space.classes(), *info, form);
    return {};
}

/// What is below a class, or below none: its children, or all. In the order of names.
std::vector<const Class_Info*> classes_below(const Operation_Call& call)
{
    const Class_Catalogue& classes = call.space.classes();
    const std::string top = call.parameters.class_name("ClassName");
    const bool deep = call.parameters.flag("DeepInheritance", false);
    if (!top.empty() && !classes.find(top))
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_CLASS, top);
    std::vector<const Class_Info*> result;
    for (const std::string& name : classes.class_names()) {
        const Class_Info* info = classes.find(name);
        const bool is_below = top.empty() || (classes.is_a(name, top) && !same_name(name, top));
        if (deep ? is_below : same_name(info->superclass, top))
            result.push_back(info);
    }
    std::ranges::sort(result, {}, &Class_Info::name);
    return result;
}

Result enumerate_classes(const Operation_Call& call)
{
    const Class_Form form = class_form(call);
    const auto found = classes_below(call);
    call.answer.open_values();
    for (const Class_Info* info : found) {
        write_class(call.answer.object(), call.space.classes(), *info, form);
        if (!call.answer.object_done())
            break;
    }
    return {};
}

Result enumerate_class_names(const Operation_Call& call)
{
    const auto found = classes_below(call);
    call.answer.open_values();
    for (const Class_Info* info : found)
        write_class_name(call.answer.object(), info->name);
    return {};
}

Result get_qualifier(const Operation_Call& call)
{
    call.parameters.required("QualifierName");
    const std::string name = call.parameters.text("QualifierName");
    const Qualifier_Kind* kind = find_qualifier(name);
    if (!kind)
        return failed(CMPI_RC_ERR_NOT_FOUND, name);
    write_declaration(call.answer.object(), *kind);
    return {};
}

Result enumerate_qualifiers(const Operation_Call& call)
{
    call.answer.open_values();
    for (const Qualifier_Kind& kind : qualifier_kinds())
        write_declaration(call.answer.object(), kind);
    return {};
}

// clang-format off
constexpr Operation_Row class_rows[] = {
    {"GetClass",            "ClassName LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList",    false, get_class},
    {"EnumerateClasses",    "ClassName DeepInheritance LocalOnly IncludeQualifiers IncludeClassOrigin", true,  enumerate_classes},
    {"EnumerateClassNames", "ClassName DeepInheritance",                                                false, enumerate_class_names},
    {"GetQualifier",        "QualifierName",                                                            false, get_qualifier},
    {"EnumerateQualifiers", "",                                                                         false, enumerate_qualifiers},
};
// clang-format on

} // namespace

std::span<const Operation_Row> class_operations()
{
    return class_rows;
}

} // namespace KPRV::kldrcim
