#pragma once

#include "module/runtime/objects/Meta_Class.h"

#include <string>
#include <vector>

/// How the tests of this folder look at the catalogue: by name, and as text.
namespace KPRV::catalogue_view {

/// All classes, in the order of the repository.
std::vector<const Meta_Class*> classes();
/// The class of the name; fails the test and ends it if there is none.
const Meta_Class& find(const std::string& name);
/// Position of the feature in the flat array; fails the test if there is none.
uint32 position(const Meta_Class& meta_class, const std::string& feature);

/// Names of the flags, joined by the separator, in the order of their bits.
std::string flags(uint32 word, const char* separator = ",");
/// The type as MOF names it, or the target of a reference; with [] behind it for an array.
std::string type(const Meta_Feature& feature);
/// The default as text, empty for none.
std::string default_text(const Meta_Feature& feature);

/// A class with the features that it declares itself, one per line, each with its position in the flat array.
std::string describe(const Meta_Class& meta_class);
/// A method with its parameters, one per line.
std::string describe(const std::string& owner, const Meta_Method& method);

const Meta_Property& as_property(const Meta_Feature& feature);
const Meta_Reference& as_reference(const Meta_Feature& feature);
const Meta_Method& as_method(const Meta_Feature& feature);

/// The features that the class declares itself, in flat order.
std::vector<const Meta_Feature*> own_features(const Meta_Class& meta_class);

} // namespace KPRV::catalogue_view
