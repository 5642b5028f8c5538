#pragma once

#include "broker/values/Class_Catalogue.h"
#include "broker/values/Request.h"
#include "kldrcim/wire/Xml_Writer.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Which properties of an instance are written, and what with them.
struct Instance_Form
{
    /// Only these; all if it is absent.
    Property_List properties = {};
    /// Only those that this class has; null for all.
    const Class_Info* seen_as = nullptr;
    /// Where a property was first declared is looked up here and written; null for not.
    const Class_Catalogue* origins = nullptr;
};

/// LOCALNAMESPACEPATH of "root/kaldera".
void write_name_space(Xml_Writer& writer, std::string_view name_space);
/// INSTANCENAME: class and keys.
void write_instance_name(Xml_Writer& writer, const Path_Value& path);
/// LOCALINSTANCEPATH; the path has a name space.
void write_local_instance_path(Xml_Writer& writer, const Path_Value& path);
/// INSTANCEPATH. A path without host gets this one.
void write_instance_path(Xml_Writer& writer, const Path_Value& path, std::string_view host);
/// CLASSNAME.
void write_class_name(Xml_Writer& writer, std::string_view name);
/// CLASSPATH.
void write_class_path(Xml_Writer& writer, std::string_view name_space, std::string_view name,
                      std::string_view host);
/// LOCALCLASSPATH.
void write_local_class_path(Xml_Writer& writer, std::string_view name_space, std::string_view name);

/// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY, with as much of a path as it has; nothing for null.
void write_value(Xml_Writer& writer, const Plain_Value& value);
/// VALUE or VALUE.ARRAY of texts.
void write_text_value(Xml_Writer& writer, std::string_view text);
void write_text_array(Xml_Writer& writer, const std::vector<std::string>& texts);

/// INSTANCE. Its path is not part of it.
void write_instance(Xml_Writer& writer, const Instance_Value& instance, const Instance_Form& form = {});

/// PARAMVALUE of a method, or RETURNVALUE where the tag is that. A null value keeps its type.
void write_parameter(Xml_Writer& writer, const Named_Value& parameter);
void write_return_value(Xml_Writer& writer, const Plain_Value& value);

/// Where a feature was first declared: the class itself, or the highest of its ancestors that has it.
std::string origin_of_property(const Class_Catalogue& catalogue, std::string_view class_name,
                               std::string_view property);

} // namespace KPRV::kldrcim
