#include "module/adapter/Guarded_Call.h"

#include "contracts/adapter/HbaAgentError.h"
#include "module/adapter/No_Address.h"

#include <exception>

namespace KPRV {

void log_caught(const Guarded_Entry& entry, Call_Site site)
{
    const auto say = [&](const char* format, auto... arguments) {
        log(Log_Level::ERR, site.file, site.line, format, arguments...);
    };
    const char* address = entry.address ? entry.address : "";
    const char* dash = entry.address ? " - " : "";
    try {
        throw;
    } catch (const HbaAgentError& error) {
        say("%s%s%s got User exception %d: %s", address, dash, entry.name, error.code, error.message.c_str());
    } catch (const No_Address& error) {
        // Requests are made inside the guards: the entry point has no part in this.
        say("%s", error.what());
    } catch (const std::exception& error) {
        say("%s%s%s got std exception: %s", address, dash, entry.name, error.what());
    } catch (...) {
        if (entry.default_for)
            say("%s got default exception for %s", entry.name, entry.default_for);
        else
            say("%s%s%s got default exception", address, dash, entry.name);
    }
}

} // namespace KPRV
