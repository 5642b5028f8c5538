#pragma once

#include "broker/values/Class_Catalogue.h"
#include "kldrcim/wire/Wire_Error.h"
#include "kldrcim/wire/Xml_Document.h"

namespace KPRV::kldrcim {

/// Reads paths, values and instances out of elements. Types that the elements do not tell come from the
/// catalogue, where it has the class. Everything here throws `Wire_Error`: not valid where something is
/// missing, status 13 where a text is no value of its type.
class Instance_Reader
{
public:
    explicit Instance_Reader(const Class_Catalogue& catalogue) : _catalogue(catalogue) {}

    /// INSTANCENAME, CLASSNAME, and each kind of path around them. Keys have the type of their class; without
    /// one that is known that of TYPE, or else string, boolean, uint64, sint64 or real64 by VALUETYPE.
    Path_Value path(Xml_Node node) const;
    /// LOCALNAMESPACEPATH, slashes in between.
    static std::string name_space(Xml_Node node);

    /// INSTANCE; its path has the class alone.
    Instance_Value instance(Xml_Node node) const;
    /// VALUE.NAMEDINSTANCE and the other elements that hold an instance and its path. A path of a class,
    /// beside a CLASS, is not for this.
    Instance_Value instance_with_path(Xml_Node node) const;

    /// A value element as a value of the type, whose array bit counts; an absent one is null.
    Plain_Value value(Xml_Node node, CMPIType type) const;

    /// PARAMVALUE. Its type is that of the declaration, if there is one.
    Named_Value parameter(Xml_Node node, const Feature_Info* declared) const;
    /// RETURNVALUE.
    Plain_Value return_value(Xml_Node node) const;

private:
    Named_Value key(Xml_Node node, const Class_Info* owner) const;
    Plain_Value key_value(Xml_Node node, const Feature_Info* declared) const;
    Named_Value property(Xml_Node node, const Class_Info* owner) const;
    Plain_Value scalar(Xml_Node node, CMPIType type) const;
    Plain_Value embedded(std::string_view text) const;

    const Class_Catalogue& _catalogue;
    /// How many instances this one is embedded in.
    unsigned _depth = 0;
};

} // namespace KPRV::kldrcim
