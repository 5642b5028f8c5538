#pragma once

#include <string>

namespace KPRV::kldrcim {

/// Writes a file so that whoever reads it meets the old text or the new one, never a part: beside it, under a
/// name that begins with a dot and ends otherwise, and then in its place. Gives 0 or an errno, with the file
/// as it was.
int write_whole_file(const std::string& name, const std::string& text);

} // namespace KPRV::kldrcim
