#pragma once

#include <set>
#include <string>

namespace KPRV::simulator {

/// Which counters have been set to 0. Figures stand still, so one that was reset stays at 0.
class Reset_Marks
{
public:
    /// The counters of `group` at the path of a Target, and of all that lies behind it.
    void reset(const std::string& group, const std::string& path);

    /// All counters of something that is new.
    void start_anew(const std::string& path) { reset("", path); }

    bool is_reset(const std::string& group, const std::string& path) const;

private:
    std::set<std::string> _marks;
};

} // namespace KPRV::simulator
