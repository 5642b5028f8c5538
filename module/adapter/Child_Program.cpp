#include "module/adapter/Child_Program.h"

#include <fcntl.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <string>
#include <vector>

// How it works. A server may ignore SIGCHLD, or wait for every child that it has: the status of a child of
// its own would be lost. So the program is the child of a process in between, which waits for it and tells
// the status through a pipe; the server reads there until the status or the end of the pipe comes. Only then
// does it wait for the process in between, and whether somebody else has done so before makes no difference.
//
// Other threads of the server may hold locks at the fork, those of the heap too. So all that allocates is
// done before: the search path is cut into places, and the arguments stand ready. What follows in both
// processes is safe after a fork: signals are blocked on the way there, so that no handler of the server runs
// in a process that is not the server; dispositions and mask go back to a process's first ones, descriptors
// but three are closed, and the places are tried one after the other. A program that is nowhere ends as a
// shell would have it.

namespace KPRV {

namespace {

constexpr int NOT_FOUND = 127;
constexpr int CANNOT_RUN = 126;
constexpr int FIRST_AFTER_STANDARD = STDERR_FILENO + 1;

/// Where a program of that name may lie, in the order of the search path.
std::vector<std::string> places_of(const std::string& name)
{
    const char* const path = getenv("PATH");
    const std::string folders = path ? path : "/bin:/usr/bin";
    std::vector<std::string> places;
    for (size_t begin = 0; begin <= folders.size();) {
        const size_t end = std::min(folders.find(':', begin), folders.size());
        const std::string folder = folders.substr(begin, end - begin);
        places.push_back((folder.empty() ? "." : folder) + "/" + name);
        begin = end + 1;
    }
    return places;
}

struct Program
{
    /// Of both the last one is null.
    std::vector<const char*> places;
    const char* const* arguments;
};

class Pipe
{
public:
    Pipe()
    {
        if (pipe2(_ends, O_CLOEXEC) != 0)
            return;
        // A server may have closed its standard descriptors: the pipe is not to take their place.
        for (int& end : _ends)
            if (end < FIRST_AFTER_STANDARD) {
                const int low = end;
                end = fcntl(low, F_DUPFD_CLOEXEC, FIRST_AFTER_STANDARD);
                close(low);
            }
    }
    ~Pipe()
    {
        close_end(_ends[0]);
        close_end(_ends[1]);
    }
    Pipe(const Pipe&) = delete;
    Pipe& operator=(const Pipe&) = delete;

    bool okay() const { return _ends[0] >= 0 && _ends[1] >= 0; }
    int writing() const { return _ends[1]; }

    /// What the other end writes, once this process has closed its own. False if that writes nothing.
    bool read_status(int& status)
    {
        close_end(_ends[1]);
        ssize_t size;
        do {
            size = read(_ends[0], &status, sizeof status);
        } while (size < 0 && errno == EINTR);
        return size == sizeof status;
    }

private:
    static void close_end(int& end)
    {
        // Either way (boundary): no end takes the place of a standard descriptor.
        if (end >= 0)
            close(end);
        end = -1;
    }

    int _ends[2] = {-1, -1};
};

/// No signal for the calling thread, and so for what it forks.
class Signals_Blocked
{
public:
    Signals_Blocked()
    {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &_before);
    }
    ~Signals_Blocked() { pthread_sigmask(SIG_SETMASK, &_before, nullptr); }
    Signals_Blocked(const Signals_Blocked&) = delete;
    Signals_Blocked& operator=(const Signals_Blocked&) = delete;

private:
    sigset_t _before;
};

int wait_for(pid_t child)
{
    int status = -1;
    // Either way (boundary): it never gives 0, since it waits.
    while (waitpid(child, &status, 0) < 0)
        if (errno != EINTR)
            return -1;
    return status;
}

void set_default_dispositions()
{
    struct sigaction standard = {};
    standard.sa_handler = SIG_DFL;
    for (int number = 1; number < NSIG; number++)
        sigaction(number, &standard, nullptr);
}

/// Of the server's descriptors standard output and error stay, and the one that is kept, which gets the
/// number behind them.
void leave_descriptors(int kept)
{
    const int null = open("/dev/null", O_RDWR);
    dup2(null, STDIN_FILENO);
    // One that is not open would be taken by the first file that the program opens.
    for (const int standard : {STDOUT_FILENO, STDERR_FILENO})
        if (fcntl(standard, F_GETFD) < 0)
            dup2(null, standard);
    dup3(kept, FIRST_AFTER_STANDARD, O_CLOEXEC);
    constexpr unsigned FIRST_TO_GO = FIRST_AFTER_STANDARD + 1;
    // Either way (constant): what is closed may be closed once more.
    if (close_range(FIRST_TO_GO, ~0u, 0) != 0)
        for (long each = sysconf(_SC_OPEN_MAX); each >= long(FIRST_TO_GO); each--)
            close(int(each));
}

[[noreturn]] void become(const Program& program)
{
    sigset_t none;
    sigemptyset(&none);
    pthread_sigmask(SIG_SETMASK, &none, nullptr);
    int code = NOT_FOUND;
    for (const char* const* place = program.places.data(); *place; place++) {
        execve(*place, const_cast<char* const*>(program.arguments), environ);
        if (errno != ENOENT && errno != ENOTDIR)
            code = CANNOT_RUN;
    }
    _exit(code);
}

/// The process in between.
[[noreturn]] void run_and_tell(const Program& program, int telling)
{
    set_default_dispositions();
    leave_descriptors(telling);
    const pid_t child = _Fork();
    if (child == 0)
        become(program);
    // Either way (boundary): the child itself has become the program.
    const int status = child < 0 ? -1 : wait_for(child);
    (void)!write(FIRST_AFTER_STANDARD, &status, sizeof status);
    _exit(0); // Either way (constant): nobody asks how it ended.
}

} // namespace

int run_program(const char* const* arguments)
{
    const std::vector<std::string> places = places_of(arguments[0]);
    Program program = {{}, arguments};
    for (const std::string& place : places)
        program.places.push_back(place.c_str());
    program.places.push_back(nullptr);

    Pipe pipe;
    if (!pipe.okay())
        return -1;
    pid_t between;
    {
        const Signals_Blocked blocked;
        between = _Fork();
        if (between == 0)
            run_and_tell(program, pipe.writing());
    }
    if (between < 0)
        return -1;
    int status = -1;
    if (!pipe.read_status(status))
        status = -1;
    // The server may have taken it already.
    wait_for(between);
    return status;
}

} // namespace KPRV
