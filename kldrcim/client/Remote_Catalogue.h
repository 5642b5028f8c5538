#pragma once

#include "broker/values/Class_Catalogue.h"
#include "kldrcim/client/Http_Client.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <map>

namespace KPRV::kldrcim {

using namespace broker;

/// The classes of one name space of a server, each asked for once, when it is first needed. It has a
/// connection of its own: facts are needed while an answer is read. Safe for any thread.
class Remote_Catalogue final : public Class_Catalogue
{
public:
    Remote_Catalogue(const Http_Settings& settings, std::string name_space);

    std::vector<std::string> class_names() const override;
    const Class_Info* find(std::string_view name) const override;
    std::string module_name() const override { return {}; }

private:
    std::unique_ptr<Class_Info> ask(const std::string& name) const REQUIRES(_mutex);

    const std::string _name_space;
    mutable Standard_Mutex<> _mutex;
    mutable Http_Client _http GUARDED_BY(_mutex);
    /// By lower-case name; null for one that there is not.
    mutable std::map<std::string, std::unique_ptr<Class_Info>, std::less<>> _classes GUARDED_BY(_mutex);
    mutable std::optional<std::vector<std::string>> _names GUARDED_BY(_mutex);
};

} // namespace KPRV::kldrcim
