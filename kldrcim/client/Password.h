#pragma once

#include <optional>
#include <string>

namespace KPRV::kldrcim {

/// The first line of a file that is closed to others. Nothing with a one-line `error`.
std::optional<std::string> password_of_file(const std::string& file, std::string& error);

/// What is typed at the terminal, unseen. Nothing with `error`, also where there is no terminal.
std::optional<std::string> password_of_terminal(const std::string& prompt, std::string& error);

} // namespace KPRV::kldrcim
