#include "kldrcim/verbs/Cli_Watch.h"

#include "broker/Subscription.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Output.h"
#include "kldrcim/verbs/Interruption.h"
#include "module/runtime/Standard_Mutex.h"

#include <deque>

namespace KPRV::kldrcim {

namespace {

constexpr const char* alert_class = "KALDERA_AlertIndication";

/// Indications between the thread that delivers them and the one that writes them.
class Inbox
{
public:
    explicit Inbox(Interruption& interruption) : interruption_(interruption) {}

    void put(const std::string& name_space, const Instance_Value& indication)
    {
        {
            const Auto_Lock lock(mutex_);
            indications_.push_back(indication);
            indications_.back().path.name_space = name_space;
        }
        interruption_.wake();
    }
    /// Waits; false when the watch is interrupted.
    bool take(Instance_Value& indication)
    {
        for (;;) {
            interruption_.wait();
            const Auto_Lock lock(mutex_);
            if (interruption_.count() != 0)
                return false;
            if (indications_.empty())
                continue;
            indication = std::move(indications_.front());
            indications_.pop_front();
            return true;
        }
    }

private:
    Interruption& interruption_;
    Standard_Mutex<> mutex_;
    std::deque<Instance_Value> indications_ GUARDED_BY(mutex_);
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

void write(const Cli_Options& options, Instance_Value& indication)
{
    if (options.properties)
        std::erase_if(indication.properties, [&](const Named_Value& property) {
            return !contains_name(*options.properties, property.name);
        });
    write_instance(options, {indication});
    if (options.format == Cli_Options::Format::TABLE)
        put("\n");
    flush_output();
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

    Interruption interruption;
    Inbox inbox(interruption);
    const Sink_Scope sink(host, [&](const std::string& name_space, const Instance_Value& indication) {
        inbox.put(name_space, indication);
        return CMPI_RC_OK;
    });
    Subscription subscription(host, provider_class);
    for (const std::string& name_space : name_spaces)
        if (const CMPIrc rc = subscription.add(name_space); rc != CMPI_RC_OK)
            return refused(name_space, provider_class, rc);
    Instance_Value indication;
    for (unsigned written = 0; options.count == 0 || written < options.count; ++written) {
        if (!inbox.take(indication))
            break;
        write(options, indication);
    }
    return 0;
}

} // namespace KPRV::kldrcim
