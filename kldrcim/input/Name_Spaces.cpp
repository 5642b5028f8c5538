#include "kldrcim/input/Name_Spaces.h"

namespace KPRV::kldrcim {

bool is_own_module(const Host& host)
{
    return host.catalogue().module_name() == "kldrprovider_Module";
}

bool is_served(const Host& host, const std::string& name_space, std::string& error)
{
    if (!is_own_module(host))
        return true;
    // What --server-instances brings is for the module, and no client reaches it.
    static constexpr const char* served = "root/kaldera";
    if (same_name(name_space, served))
        return true;
    error = "no namespace \"" + name_space + "\"; there is " + served;
    return false;
}

} // namespace KPRV::kldrcim
