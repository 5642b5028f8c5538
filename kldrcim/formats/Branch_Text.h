#pragma once

#include <string>
#include <vector>

namespace KPRV::kldrcim {

/// What stands before a line: the last child of its parent ends the parent's line of descent.
struct Twigs
{
    const char* child;
    const char* last_child;
    const char* passing;
    const char* nothing;
};

const Twigs& twigs(bool ascii);

/// A line with those that hang from it.
struct Text_Branch
{
    std::string line;
    std::vector<Text_Branch> children;
};

/// One line a branch, drawn with box-drawing characters or in ASCII; the roots stand at the left.
std::string branch_text(const std::vector<Text_Branch>& roots, bool ascii);

/// True if box-drawing characters reach the user. Asked of the environment's locale without making it the
/// process's: the module should not notice.
bool locale_is_utf8();

} // namespace KPRV::kldrcim
