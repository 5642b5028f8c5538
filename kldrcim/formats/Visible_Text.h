#pragma once

#include <string>

namespace KPRV::kldrcim {

/// Control characters, which could move a terminal's cursor, made visible: "\n" and "\t" for line breaks and
/// tabs, "?" for others. The result is one line.
std::string visible_text(const std::string& text);

/// The same, but line breaks and tabs stay.
std::string visible_lines(const std::string& text);

} // namespace KPRV::kldrcim
