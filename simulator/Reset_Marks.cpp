#include "simulator/Reset_Marks.h"

namespace KPRV::simulator {

namespace {

std::string mark(const std::string& group, const std::string& path)
{
    return group + " " + path;
}

} // namespace

void Reset_Marks::reset(const std::string& group, const std::string& path)
{
    _marks.insert(mark(group, path));
}

bool Reset_Marks::is_reset(const std::string& group, const std::string& path) const
{
    for (std::size_t end = path.find('/');; end = path.find('/', end + 1)) {
        const std::string above = path.substr(0, end);
        if (_marks.contains(mark(group, above)) || _marks.contains(mark("", above)))
            return true;
        if (end == std::string::npos)
            return false;
    }
}

} // namespace KPRV::simulator
