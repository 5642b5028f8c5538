#include "kldrcim/verbs/Cli_Watch.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Output.h"
#include "kldrcim/verbs/Interruption.h"
#include "kldrcim/verbs/Result_Filter.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <deque>

namespace KPRV::kldrcim {

namespace {

constexpr const char* alert_class = "KALDERA_AlertIndication";

/// Indications between the thread that delivers them and the one that writes them.
class Inbox
{
public:
    explicit Inbox(Interruption& interruption) : _interruption(interruption) {}

    void put(const std::string& name_space, const Instance_Value& indication)
    {
        {
            const Auto_Lock lock(_mutex);
            _indications.push_back(indication);
            _indications.back().path.name_space = name_space;
        }
        _interruption.wake();
    }
    /// Waits; false when the watch is interrupted.
    bool take(Instance_Value& indication)
    {
        for (;;) {
            _interruption.wait();
            const Auto_Lock lock(_mutex);
            if (_interruption.count() != 0)
                return false;
            if (_indications.empty())
                continue;
            indication = std::move(_indications.front());
            _indications.pop_front();
            return true;
        }
    }

private:
    Interruption& _interruption;
    Standard_Mutex<> _mutex;
    std::deque<Instance_Value> _indications GUARDED_BY(_mutex);
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
