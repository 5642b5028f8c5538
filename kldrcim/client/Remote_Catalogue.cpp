// The classes of a server, by GetClass.
#include "kldrcim/client/Remote_Catalogue.h"

#include "kldrcim/client/Cim_Answer.h"
#include "kldrcim/client/Cim_Request.h"
#include "kldrcim/wire/Class_Xml.h"

namespace KPRV::kldrcim {

Remote_Catalogue::Remote_Catalogue(const Http_Settings& settings, std::string name_space)
    : _name_space(std::move(name_space)), _http(settings)
{
}

std::vector<std::string> Remote_Catalogue::class_names() const
{
    const Auto_Lock lock(_mutex);
    if (!_names) {
        std::vector<std::string>& names = _names.emplace();
        Cim_Answer answer(_http, [&](Xml_Node node) {
            names.emplace_back(node.attribute(Xml_Attribute::NAME));
            return true;
        });
        // A server that does not tell has none that could be listed.
        answer.ask(write_class_names_request(_name_space), No_Catalogue());
    }
    return *_names;
}

const Class_Info* Remote_Catalogue::find(std::string_view name) const
{
    const Auto_Lock lock(_mutex);
    auto [at, is_new] = _classes.try_emplace(lower_name(name));
    if (is_new)
        at->second = ask(std::string(name));
    return at->second.get();
}

std::unique_ptr<Class_Info> Remote_Catalogue::ask(const std::string& name) const
{
    std::unique_ptr<Class_Info> info;
    if (name.empty())
        return info;
    Cim_Answer answer(_http, [&](Xml_Node node) {
        info = std::make_unique<Class_Info>(read_class(node));
        return true;
    });
    const Result result = answer.ask(write_class_request(_name_space, name), No_Catalogue());
    return result.ok() ? std::move(info) : nullptr;
}

} // namespace KPRV::kldrcim
