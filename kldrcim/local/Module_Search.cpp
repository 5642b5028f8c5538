#include "kldrcim/local/Module_Search.h"

#include <filesystem>

namespace KPRV::kldrcim {

std::string default_module()
{
    namespace fs = std::filesystem;
    const fs::path file = "libkldrprovider_Module.so";
    std::error_code error;
    const fs::path own = fs::read_symlink("/proc/self/exe", error).parent_path();
    for (const fs::path& folder : {own, own / "../lib/cim", fs::path("/usr/lib/cim")})
        if (!folder.empty() && fs::exists(folder / file, error))
            return folder / file;
    return file;
}

} // namespace KPRV::kldrcim
