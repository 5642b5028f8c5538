#pragma once

#include "contracts/cmpi/cmpift.h"

#include <memory>
#include <string>

namespace KPRV {
struct Registration;
}

namespace KPRV::broker {

/// The four kinds of management interface that the host uses.
enum class Mi_Kind
{
    INSTANCE,
    ASSOCIATION,
    METHOD,
    INDICATION,
};

inline constexpr Mi_Kind mi_kinds[] = {Mi_Kind::INSTANCE, Mi_Kind::ASSOCIATION, Mi_Kind::METHOD,
                                       Mi_Kind::INDICATION};

/// "Instance", "Association", "Method", "Indication", as factory names have it.
const char* mi_kind_name(Mi_Kind kind);

/// A provider library, opened as CIM servers do it: all symbols resolved at once and made global.
class Module
{
public:
    /// Null on failure, with `error` set to what the loader says.
    static std::unique_ptr<Module> open(const std::string& path, std::string& error);
    ~Module();
    Module(const Module&) = delete;
    Module& operator=(const Module&) = delete;

    /// Address of an exported symbol, null if there is none.
    void* symbol(const std::string& name) const;

    /// Factory `<class>_Provider_Create_<Kind>MI`, else `<class>_Create_<Kind>MI`; null if neither is
    /// exported.
    void* factory(const std::string& class_name, Mi_Kind kind) const;

    /// What `cimple_module()` answers, null if the library does not export it.
    const Registration* registrations() const;

    const std::string& path() const { return _path; }

private:
    Module(void* handle, std::string path) : _handle(handle), _path(std::move(path)) {}

    void* _handle;
    std::string _path;
};

} // namespace KPRV::broker
