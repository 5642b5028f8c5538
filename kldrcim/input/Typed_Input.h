#pragma once

#include "broker/values/Class_Catalogue.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Turns texts of the command line into values of the types that the class declares. Where the class is
/// unknown, the text decides: true and false, numbers, {lists}, and texts. Each function gives false and a
/// one-line `error` for what does not fit.

/// A text that is malformed is reported with its column.
bool typed_path(const Class_Catalogue& catalogue, const std::string& text, Path_Value& path,
                std::string& error);

/// A value for a property or parameter of that type; `what` names it in the error.
bool typed_value(const Class_Catalogue& catalogue, CMPIType type, const std::string& text,
                 const std::string& what, Plain_Value& value, std::string& error);

/// The value that the text looks like.
Plain_Value guessed_value(const std::string& text);

/// "NAME=VALUE" for a property of the class, or for an in parameter if a method is given.
bool typed_assignment(const Class_Catalogue& catalogue, const std::string& class_name,
                      const std::string& method, const std::string& text, Named_Value& assignment,
                      std::string& error);

/// Error if the class is known and has no such property.
bool check_properties(const Class_Catalogue& catalogue, const std::string& class_name,
                      const std::vector<std::string>& names, std::string& error);

} // namespace KPRV::kldrcim
