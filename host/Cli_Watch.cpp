#include "host/Cli_Watch.h"

#include "host/Cli_Complaints.h"
#include "host/Cli_Output.h"
#include "host/Convert.h"
#include "host/Subscription.h"

#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <deque>
#include <semaphore.h>

namespace KPRV::host {

namespace {

constexpr const char* alert_class = "KALDERA_AlertIndication";

/// Counts what there is to do: indications that have come, and the interruption. A signal handler may post
/// it.
sem_t work;
std::atomic<bool> is_interrupted;

extern "C" void interrupt(int)
{
    is_interrupted = true;
    sem_post(&work);
}

/// Ends the watch by SIGINT and SIGTERM, for a scope; a second one in the clean-up behind it ends the
/// program.
class Interruption
{
public:
    Interruption()
    {
        is_interrupted = false;
        sem_init(&work, 0, 0);
        set(SIGINT, interrupt, old_int_);
        set(SIGTERM, interrupt, old_term_);
        // A reader that has gone should be seen by the write, not end the program.
        set(SIGPIPE, SIG_IGN, old_pipe_);
    }
    ~Interruption()
    {
        sigaction(SIGINT, &old_int_, nullptr);
        sigaction(SIGTERM, &old_term_, nullptr);
    }
    Interruption(const Interruption&) = delete;
    Interruption& operator=(const Interruption&) = delete;

private:
    static void set(int signal, void (*handler)(int), struct sigaction& old)
    {
        struct sigaction action = {};
        action.sa_handler = handler;
        action.sa_flags = SA_RESTART;
        sigaction(signal, &action, &old);
    }

    struct sigaction old_int_ = {};
    struct sigaction old_term_ = {};
    struct sigaction old_pipe_ = {};
};

/// Indications between the thread that delivers them and the one that writes them.
class Inbox
{
public:
    void put(const std::string& name_space, const Instance_Value& indication)
    {
        {
            std::lock_guard lock(mutex_);
            indications_.push_back(indication);
            indications_.back().path.name_space = name_space;
        }
        sem_post(&work);
    }
    /// Waits; false when the watch is interrupted.
    bool take(Instance_Value& indication)
    {
        for (;;) {
            while (sem_wait(&work) != 0) {
            }
            std::lock_guard lock(mutex_);
            if (is_interrupted)
                return false;
            if (indications_.empty())
                continue;
            indication = std::move(indications_.front());
            indications_.pop_front();
            return true;
        }
    }

private:
    std::mutex mutex_;
    std::deque<Instance_Value> indications_;
};

/// Where the host's indications go, for a scope.
struct Sink_Scope
{
    Sink_Scope(Host& owner, Host::Sink sink) : host(owner) { host.set_sink(std::move(sink)); }
    ~Sink_Scope() { host.set_sink({}); }
    Sink_Scope(const Sink_Scope&) = delete;
    Sink_Scope& operator=(const Sink_Scope&) = delete;

    Host& host;
};

/// 0, or the error that the output has.
int write(const Cli_Options& options, Instance_Value& indication)
{
    if (options.properties)
        std::erase_if(indication.properties, [&](const Named_Value& property) {
            return !contains_name(*options.properties, property.name);
        });
    write_instance(options, {indication});
    if (options.format == Cli_Options::Format::TABLE)
        std::putchar('\n');
    return std::fflush(stdout) == 0 ? 0 : errno;
}

int refused(const std::string& name_space, const std::string& provider_class, CMPIrc rc)
{
    return complain(code_text(rc) + ": " + provider_class + " takes no subscription for " + name_space, 1);
}

} // namespace

int watch(const Cli_Options& options, Host& host)
{
    const std::string provider_class = options.arguments.empty() ? alert_class : options.arguments[0];
    const std::vector<std::string> name_spaces =
        options.filters.empty() ? std::vector{options.name_space} : options.filters;

    Inbox inbox;
    const Sink_Scope sink(host, [&](const std::string& name_space, const Instance_Value& indication) {
        inbox.put(name_space, indication);
        return CMPI_RC_OK;
    });
    Subscription subscription(host, provider_class);
    const Interruption interruption;
    for (const std::string& name_space : name_spaces)
        if (const CMPIrc rc = subscription.add(name_space); rc != CMPI_RC_OK)
            return refused(name_space, provider_class, rc);
    Instance_Value indication;
    for (unsigned written = 0; options.count == 0 || written < options.count; ++written) {
        if (!inbox.take(indication))
            break;
        const int error = write(options, indication);
        if (error == EPIPE)
            break;
        if (error != 0) {
            std::fprintf(stderr, "kldrcim: cannot write: %s\n", std::strerror(error));
            return 1;
        }
    }
    return 0;
}

} // namespace KPRV::host
