#pragma once

#include <string>
#include <vector>

namespace KPRV::kldrcim {

/// The word that somebody who wrote `written` most likely meant; empty if none is near.
std::string nearest_word(const std::string& written, const std::vector<std::string>& words);

/// " (did you mean \"WORD\"?)", or nothing.
std::string suggestion(const std::string& written, const std::vector<std::string>& words);

} // namespace KPRV::kldrcim
