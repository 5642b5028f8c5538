#include "broker/Module.h"

#include <dlfcn.h>

namespace KPRV::broker {

const char* mi_kind_name(Mi_Kind kind)
{
    static const char* const names[] = {"Instance", "Association", "Method", "Indication"};
    return names[static_cast<int>(kind)];
}

std::unique_ptr<Module> Module::open(const std::string& path, std::string& error)
{
    void* handle = dlopen(path.c_str(), RTLD_NOW | RTLD_GLOBAL);
    if (!handle) {
        const char* text = dlerror();
        error = text ? text : path + ": cannot be opened";
        return nullptr;
    }
    return std::unique_ptr<Module>(new Module(handle, path));
}

Module::~Module()
{
    dlclose(_handle);
}

void* Module::symbol(const std::string& name) const
{
    return dlsym(_handle, name.c_str());
}

void* Module::factory(const std::string& class_name, Mi_Kind kind) const
{
    std::string suffix = std::string("_Create_") + mi_kind_name(kind) + "MI";
    void* found = symbol(class_name + "_Provider" + suffix);
    return found ? found : symbol(class_name + suffix);
}

const Registration* Module::registrations() const
{
    auto* head = reinterpret_cast<const Registration* (*)()>(symbol("cimple_module"));
    return head ? head() : nullptr;
}

} // namespace KPRV::broker
