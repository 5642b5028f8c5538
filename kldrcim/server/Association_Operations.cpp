// Associators, references and their names.
#include "kldrcim/server/Object_Answers.h"

namespace KPRV::kldrcim {

namespace {

/// Of a class there is no answer: what is associated with classes, their qualifiers say.
Path_Value source_of(const Operation_Call& call)
{
    if (call.parameters.required("ObjectName").is(Xml_Tag::CLASSNAME))
        throw Wire_Error::status(CMPI_RC_ERR_NOT_SUPPORTED, "associations of classes are not told");
    return call.path("ObjectName");
}

template <Operation Kind>
Result associate(const Operation_Call& call)
{
    constexpr bool is_reference = Kind == Operation::REFERENCES || Kind == Operation::REFERENCE_NAMES;
    constexpr bool has_properties = Kind == Operation::REFERENCES || Kind == Operation::ASSOCIATORS;
    Instance_Form form;
    if (has_properties) {
        form.properties = call.parameters.names("PropertyList");
        if (call.parameters.flag("IncludeClassOrigin", false))
            form.origins = &call.space.classes();
    }
    Request request = call.request(Kind, source_of(call));
    request.properties = form.properties;
    request.filter.result_class = call.parameters.class_name("ResultClass");
    request.filter.role = call.parameters.text("Role");
    if (!is_reference) {
        request.filter.association_class = call.parameters.class_name("AssocClass");
        request.filter.result_role = call.parameters.text("ResultRole");
    }
    call.answer.open_values();
    Object_Answers receiver(call, form, Object_Text::OBJECTS);
    return receiver.run(std::move(request));
}

// clang-format off
constexpr Operation_Row association_rows[] = {
    {"Associators",     "ObjectName AssocClass ResultClass Role ResultRole IncludeQualifiers IncludeClassOrigin PropertyList",
     true, associate<Operation::ASSOCIATORS>},
    {"AssociatorNames", "ObjectName AssocClass ResultClass Role ResultRole", true, associate<Operation::ASSOCIATOR_NAMES>},
    {"References",      "ObjectName ResultClass Role IncludeQualifiers IncludeClassOrigin PropertyList",
     true, associate<Operation::REFERENCES>},
    {"ReferenceNames",  "ObjectName ResultClass Role",                       true, associate<Operation::REFERENCE_NAMES>},
};
// clang-format on

} // namespace

std::span<const Operation_Row> association_operations()
{
    return association_rows;
}

} // namespace KPRV::kldrcim
