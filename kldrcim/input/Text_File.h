#pragma once

#include <optional>
#include <string>

namespace KPRV::kldrcim {

/// The text of a file, or with "-" of standard input. Nothing with a one-line `error`, which is the system's.
std::optional<std::string> read_text_file(const std::string& name, std::string& error);

} // namespace KPRV::kldrcim
