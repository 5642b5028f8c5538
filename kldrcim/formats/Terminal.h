#pragma once

#include <cstddef>

namespace KPRV::kldrcim {

/// Columns of the terminal on standard output; 0 if it is none, or does not say.
std::size_t terminal_width();

/// True if standard output is a terminal whose user has nothing against colors (NO_COLOR, TERM=dumb).
bool terminal_shows_colors();

} // namespace KPRV::kldrcim
