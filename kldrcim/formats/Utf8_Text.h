#pragma once

#include <string>

namespace KPRV::kldrcim {

/// A text of the adapter library as UTF-8: each byte that is part of no character of it becomes U+FFFD.
std::string utf8_text(const std::string& text);

} // namespace KPRV::kldrcim
