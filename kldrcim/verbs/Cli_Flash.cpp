#include "kldrcim/verbs/Cli_Flash.h"

#include "broker/values/Path_Parser.h"
#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Visible_Text.h"
#include "kldrcim/input/Address_Words.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Interruption.h"
#include "kldrcim/walks/Host_Facts.h"

#include <algorithm>
#include <cstdio>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

constexpr int NO_SUCH_ADAPTER = 2;

constexpr const char* service_class = "KALDERA_HBASoftwareInstallationService";
constexpr const char* controller_class = "KALDERA_PortController";
constexpr const char* software_association = "KALDERA_AdapterElementSoftwareIdentity";

/// Code of the CIM Schema: what is asked for.
constexpr std::uint64_t OPTION_UPDATE = 5;

std::string device_id(const Path_Value& controller)
{
    const Plain_Value* id = controller.key("DeviceID");
    return id ? id->as_text() : "";
}

/// The controller that the user's word names: a path, or an address in any form. Null if there is none.
const Path_Value* find_controller(const std::vector<Path_Value>& controllers, const std::string& word)
{
    Path_Error error;
    const auto path = parse_path(word, error);
    const auto found = std::ranges::find_if(controllers, [&](const Path_Value& each) {
        return path && !path->keys.empty() ? same_object(each, *path)
                                           : address_digits(device_id(each)) == address_digits(word);
    });
    return found == controllers.end() ? nullptr : &*found;
}

/// Version of the adapter's firmware, as the module publishes it now; nothing if it does not.
std::optional<std::string> firmware_version(Connection& connection, const Path_Value& controller)
{
    Association_Index index(connection);
    for (const Path_Value& end :
         index.far_ends(software_association, "Dependent", controller, "Antecedent")) {
        const Instance_Value software = index.instance(end);
        const Plain_Value* kinds = software.property("Classifications");
        const Plain_Value* version = software.property("VersionString");
        if (kinds && version && !version->null &&
            std::ranges::any_of(kinds->elements(), [](const Plain_Value& kind) {
                return kind.as_uint() == CLASSIFICATION_FIRMWARE;
            }))
            return visible_text(plain_text(*version));
    }
    return std::nullopt;
}

/// An update that the provider has answered.
struct Update
{
    std::string adapter;
    std::string uri;
    std::uint64_t return_value;
    std::optional<std::string> before;
    std::optional<std::string> after;
};

std::string as_json(const Update& update)
{
    const auto text_or_null = [](const std::optional<std::string>& text) {
        return text ? json_string(*text) : "null";
    };
    return json_object({{"adapter", json_string(update.adapter)},
                        {"uri", json_string(update.uri)},
                        {"return_value", std::to_string(update.return_value)},
                        {"firmware_before", text_or_null(update.before)},
                        {"firmware_after", text_or_null(update.after)}}) +
           "\n";
}

std::string as_line(const Update& update)
{
    std::string line = update.adapter + ": firmware updated";
    if (update.before && update.after && update.before != update.after)
        line += " from " + *update.before + " to " + *update.after;
    else if (update.after)
        line += ", still version " + *update.after;
    return line + "\n";
}

int tell(const Cli_Options& options, const Update& update)
{
    const bool is_json = options.format == Cli_Options::Format::JSON;
    if (is_json || update.return_value == 0)
        put(is_json ? as_json(update) : as_line(update));
    if (update.return_value == 0)
        return 0;
    return complain(update.adapter + ": the update failed (return value " +
                        std::to_string(update.return_value) + "); the module's log says why",
                    FAILURE);
}

/// What the user answers; only a yes is one.
bool is_wanted(const Update& update)
{
    std::fprintf(stderr, "Update the firmware of adapter %s%s from %s? [y/N] ", update.adapter.c_str(),
                 update.before ? (", now " + *update.before + ",").c_str() : "",
                 visible_text(update.uri).c_str());
    char answer[16] = {};
    if (!std::fgets(answer, sizeof answer, stdin))
        return false;
    std::string word = answer;
    std::erase_if(word, [](char c) { return c == '\n' || c == ' '; });
    return same_name(word, "y") || same_name(word, "yes");
}

} // namespace

int flash(const Cli_Options& options, Connection& connection)
{
    const std::string& word = options.arguments[0];
    const std::string& uri = options.arguments[1];
    const Result controllers = connection.enumerate_instance_names(controller_class);
    if (!controllers.ok())
        return complain(failure_text(controllers), FAILURE);
    const Path_Value* controller = find_controller(controllers.paths, word);
    if (!controller)
        return complain("no adapter \"" + word + "\"; \"kldrcim ein " + controller_class + "\" lists them",
                        NO_SUCH_ADAPTER);
    const Result services = connection.enumerate_instance_names(service_class);
    if (!services.ok() || services.paths.empty())
        return complain(services.ok() ? std::string("the module offers no ") + service_class
                                      : failure_text(services),
                        FAILURE);

    Update update = {
        visible_text(device_id(*controller)), uri, 0, firmware_version(connection, *controller), {}};
    if (!options.yes && isatty(STDIN_FILENO) && !is_wanted(update))
        return complain(update.adapter + ": not updated", FAILURE);
    flush_output();
    // An image that an adapter has in part may be its end. Who reads the promise may count on it.
    const Signals_Held_Back held_back;
    complain(update.adapter + ": updating; SIGINT, SIGTERM and SIGHUP wait for the end of it", 0);
    const Plain_Value install_options =
        Plain_Value::array(CMPI_uint16, {Plain_Value::unsigned_number(CMPI_uint16, OPTION_UPDATE)});
    const Result answer = connection.invoke_method(services.paths.front(), "InstallFromURI",
                                                   {{"URI", Plain_Value::text(uri)},
                                                    {"Target", Plain_Value::path(*controller)},
                                                    {"InstallOptions", install_options}});
    if (!answer.ok())
        return complain(failure_text(answer), FAILURE);
    update.return_value = answer.return_value.as_uint();
    update.after = firmware_version(connection, *controller);
    const int status = tell(options, update);
    flush_output();
    return status;
}

} // namespace KPRV::kldrcim
