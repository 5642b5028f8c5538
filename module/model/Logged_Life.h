#pragma once

#include "module/runtime/system/log.h"

namespace KPRV {

/// Tells the log at DBG when a helper is made and when it goes, with the module. A helper holds one as its
/// member.
class Logged_Life
{
public:
    Logged_Life(const char* name, Call_Site site) : _name(name), _site(site) { tell("Constructor"); }
    ~Logged_Life() { tell("Destructor"); }
    Logged_Life(const Logged_Life&) = delete;
    Logged_Life& operator=(const Logged_Life&) = delete;

private:
    void tell(const char* what) const { LOG_LINE(DBG, _site.file, _site.line, "Inside %s %s", _name, what); }

    const char* _name;
    Call_Site _site;
};

} // namespace KPRV
