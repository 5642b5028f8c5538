// Of `ProviderUtil`, what is asked of the system: is the agent running, fetch a file, is there a file.
#include "module/adapter/Child_Program.h"
#include "module/adapter/ProviderUtil.h"
#include "module/adapter/ProviderUtil_Log.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <memory>

namespace KPRV {

namespace {

/// True if the name that a process list shows for a live process ends in `ending`. The list shows 15
/// characters, and marks a zombie behind its name.
bool listed_name_ends_in(const char* process_id, std::string_view ending)
{
    constexpr size_t LISTED = 15;
    char path[64];
    snprintf(path, sizeof path, "/proc/%.20s/stat", process_id);
    const int file = open(path, O_RDONLY | O_CLOEXEC);
    if (file < 0)
        return false;
    char text[512];
    const ssize_t size = read(file, text, sizeof text);
    close(file);
    // Either way (boundary): an empty line is none of the form below.
    if (size <= 0)
        return false;

    // "4711 (name) S ...": the name may itself hold brackets.
    const std::string_view line(text, static_cast<size_t>(size));
    const size_t open_bracket = line.find('(');
    const size_t close_bracket = line.rfind(") ");
    if (open_bracket == line.npos || close_bracket == line.npos || close_bracket + 2 >= line.size())
        return false; // Either way (statement): the kernel writes no other form.
    const char state = line[close_bracket + 2];
    const std::string_view name =
        line.substr(open_bracket + 1, close_bracket - open_bracket - 1).substr(0, LISTED);
    return state != 'Z' && state != 'X' && name.ends_with(ending);
}

} // namespace

int ProviderUtil::getAgentPort()
{
    UTIL_SCOPE("getAgentPort");
    constexpr int AGENT_PORT = 34568;
    // The answer of "ps -e | grep qxmagent$", without the shell: only the end of a name counts.
    const std::unique_ptr<DIR, int (*)(DIR*)> processes(opendir("/proc"), closedir);
    if (!processes)
        return 0;
    while (const dirent64* entry = readdir64(processes.get())) {
        const char first = entry->d_name[0];
        if (first >= '1' && first <= '9' && listed_name_ends_in(entry->d_name, "qxmagent"))
            return AGENT_PORT;
    }
    return 0;
}

int ProviderUtil::TftpGetFile(const char* host, const char* file)
{
    UTIL_SCOPE("TftpGetFile");
    const char* const remove[] = {"rm", "-f", file, nullptr};
    const char* const fetch[] = {"tftp", host, "-c", "get", file, nullptr};
    run_program(remove);
    return run_program(fetch);
}

bool ProviderUtil::IsFileExist(const char* path)
{
    struct stat64 status;
    return stat64(path, &status) == 0;
}

} // namespace KPRV
