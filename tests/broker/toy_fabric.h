#pragma once

#include <string>
#include <vector>

/// A small host for the tests of associations: what `toy_fabric.cpp` serves. Classes are of the names that
/// the tree walks, but each has one key of type string.
namespace toy {

struct Fabric_Class
{
    const char* name;
    /// Null for a root class.
    const char* superclass;
    /// Key of a class of objects, empty for an abstract one, null for an association.
    const char* key;
    /// "Role:Class Role:Class" of an association.
    const char* roles;
    /// False for one that exists for its subclasses only.
    bool served;
};

/// "Name=text;Name=text". Which properties are numbers `fabric_type` tells.
struct Fabric_Object
{
    const char* class_name;
    const char* properties;
};

/// The objects by the texts of their keys, in the order of the roles.
struct Fabric_Link
{
    const char* class_name;
    std::vector<const char*> ends;
};

extern const std::vector<Fabric_Class> fabric_classes;
extern const std::vector<Fabric_Object> fabric_objects;
extern const std::vector<Fabric_Link> fabric_links;

/// Properties of the objects, with the words 's' text, 'n' uint16, 'N' uint64, 'a' uint16 array.
struct Fabric_Property
{
    const char* name;
    char type;
};
extern const std::vector<Fabric_Property> fabric_properties;

struct Named_Text
{
    std::string name;
    std::string text;
};

/// "Name=text;Name=text" apart, or "Role:Class Role:Class".
std::vector<Named_Text> split(const std::string& text, char between, char inside);

const Fabric_Class& fabric_class(const std::string& name);

} // namespace toy
