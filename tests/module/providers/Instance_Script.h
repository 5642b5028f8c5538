#pragma once

#include "module/runtime/dispatch/Registration.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Meta_Repository.h"
#include "module/runtime/objects/features.h"

#include <cstdlib>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace KPRV {

extern const Registration* _cimple_registration_head;

/// The pieces of a text, without blanks around them. None of an empty text.
inline std::vector<std::string> pieces(const std::string& text, char separator)
{
    std::vector<std::string> result;
    std::istringstream stream(text);
    for (std::string piece; std::getline(stream, piece, separator);) {
        const size_t first = piece.find_first_not_of(" \n");
        const size_t last = piece.find_last_not_of(" \n");
        result.push_back(first == std::string::npos ? "" : piece.substr(first, last - first + 1));
    }
    return result;
}

/// The class of that name, with or without its prefix.
inline const Meta_Class* class_named(const std::string& name)
{
    const Meta_Repository* repository = _cimple_registration_head->meta_class->meta_repository;
    const Meta_Class* found = find_meta_class(repository, ("KALDERA_" + name).c_str());
    if (!found)
        throw std::invalid_argument("no class " + name);
    return found;
}

inline void set_from_text(Instance* instance, const std::string& name, const std::string& text)
{
    const Meta_Feature* feature = find_feature(instance->__meta_class, name.c_str(), FLAG_PROPERTY);
    if (!feature)
        throw std::invalid_argument(std::string(instance->__meta_class->name) + " has no property " + name);
    const auto* property = static_cast<const Meta_Property*>(feature);
    if (property->subscript && property->type == UINT16) {
        auto& values = cell_at<Array<uint16>>(instance, property->offset);
        for (const std::string& piece : pieces(text, '+'))
            values.append(static_cast<uint16>(std::atoi(piece.c_str())));
    } else if (property->type == STRING) {
        cell_at<String>(instance, property->offset) = text.c_str();
    } else if (property->type == UINT16) {
        cell_at<uint16>(instance, property->offset) = static_cast<uint16>(std::atoi(text.c_str()));
    } else {
        throw std::invalid_argument("no text for the type of " + name);
    }
    cell_at<uint8>(instance, property->offset + null_offset(property)) = 0;
}

/// An instance of the class from "label Property=text Property=text". The label is its `Caption`, which no
/// association looks at.
inline Instance* scripted_instance(const Meta_Class* meta_class, const std::string& text)
{
    Instance* instance = create(meta_class, true);
    const std::vector<std::string> words = pieces(text, ' ');
    set_from_text(instance, "Caption", words.at(0));
    for (size_t i = 1; i < words.size(); i++) {
        const size_t equals = words[i].find('=');
        set_from_text(instance, words[i].substr(0, equals), words[i].substr(equals + 1));
    }
    return instance;
}

inline std::string label_of(const Instance* instance)
{
    const Meta_Feature* feature = find_feature(instance->__meta_class, "Caption", FLAG_PROPERTY);
    return cell_at<String>(instance, static_cast<const Meta_Property*>(feature)->offset).c_str();
}

} // namespace KPRV
