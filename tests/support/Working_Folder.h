#pragma once

#include "tests/support/Temp_Folder.h"

#include <filesystem>

namespace KPRV {

/// The process works in a folder of the test's own for a scope.
class Working_Folder : public Temp_Folder
{
public:
    Working_Folder() { std::filesystem::current_path(path()); }
    ~Working_Folder() { std::filesystem::current_path(_before); }

private:
    std::filesystem::path _before = std::filesystem::current_path();
};

} // namespace KPRV
