#include "kldrcim/verbs/Cli_Watch.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Output.h"
#include "kldrcim/verbs/Interruption.h"
#include "kldrcim/verbs/Result_Filter.h"
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

} // namespace

int watch(const Cli_Options& options, Connection& connection)
{
    const std::string indication_class = options.arguments.empty() ? alert_class : options.arguments[0];
    const std::vector<std::string> name_spaces =
        options.filters.empty() ? std::vector{options.name_space} : options.filters;

    std::string error;
    if (!check_filter(options, connection.classes(), indication_class, false, error))
        return complain(error, USAGE_ERROR);
    Interruption interruption;
    Inbox inbox(interruption);
    const auto subscription = connection.subscribe(
        indication_class, name_spaces,
        [&](const std::string& name_space, const Instance_Value& indication) {
            inbox.put(name_space, indication);
        },
        error);
    if (!subscription)
        return complain(error, FAILURE);
    Instance_Value indication;
    for (unsigned written = 0; options.count == 0 || written < options.count;) {
        if (!inbox.take(indication))
            break;
        if (!meets_conditions(options, indication.path.class_name, indication.properties))
            continue;
        write(options, indication);
        ++written;
    }
    return 0;
}

} // namespace KPRV::kldrcim
