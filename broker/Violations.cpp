#include "broker/Violations.h"

namespace KPRV::broker {

void Violations::add(const char* call, const std::string& what)
{
    const Auto_Lock lock(mutex_);
    list_.push_back(std::string(call) + ": " + what);
}

std::vector<std::string> Violations::list() const
{
    const Auto_Lock lock(mutex_);
    return list_;
}

std::size_t Violations::count() const
{
    const Auto_Lock lock(mutex_);
    return list_.size();
}

void Violations::clear()
{
    const Auto_Lock lock(mutex_);
    list_.clear();
}

std::string Violations::text() const
{
    std::string text;
    for (const std::string& line : list())
        text += line + "\n";
    return text;
}

} // namespace KPRV::broker
