#include "broker/Violations.h"

namespace KPRV::broker {

void Violations::add(const char* call, const std::string& what)
{
    const Auto_Lock lock(_mutex);
    _list.push_back(std::string(call) + ": " + what);
}

std::vector<std::string> Violations::list() const
{
    const Auto_Lock lock(_mutex);
    return _list;
}

std::size_t Violations::count() const
{
    const Auto_Lock lock(_mutex);
    return _list.size();
}

void Violations::clear()
{
    const Auto_Lock lock(_mutex);
    _list.clear();
}

std::string Violations::text() const
{
    std::string text;
    for (const std::string& line : list())
        text += line + "\n";
    return text;
}

} // namespace KPRV::broker
