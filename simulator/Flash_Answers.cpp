// The behaviour of a firmware update: an image is read, refused or taken.
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"
#include "simulator/State_Events.h"

#include <cerrno>
#include <fstream>
#include <sstream>
#include <string_view>
#include <sys/stat.h>
#include <system_error>

namespace KPRV::simulator {

namespace {

// Statuses of an update that was not done.
enum Flash_Status
{
    UNREADABLE = 1,
    NO_IMAGE = 2,
};

Json::Value update_answer(Json::Value status, const std::string& message)
{
    Json::Value answer;
    answer["status"] = std::move(status);
    answer["message"] = message;
    return answer;
}

Json::Value refusal(Flash_Status status, const std::string& message)
{
    return update_answer(Json::Value(static_cast<Json::UInt>(status)), message);
}

/// What is at the beginning of an image.
struct Image
{
    std::string head;
    std::string problem; // why it cannot be read
};

Image read_image(const std::string& file)
{
    struct stat64 status;
    if (stat64(file.c_str(), &status) != 0)
        return {{}, std::generic_category().message(errno)};
    // Anything else could keep the reader waiting.
    if (!S_ISREG(status.st_mode))
        return {{}, "not a regular file"};
    std::ifstream stream(file, std::ios::binary);
    if (!stream)
        return {{}, std::generic_category().message(errno)};
    std::string head(4096, '\0');
    stream.read(head.data(), static_cast<std::streamsize>(head.size()));
    head.resize(static_cast<std::size_t>(stream.gcount()));
    return {head, {}};
}

/// The version that a whole line of the image names, or "".
std::string version_of(const Image& image)
{
    constexpr std::string_view name = "firmware-version=";
    constexpr std::string_view characters =
        "0123456789abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ._-";
    std::istringstream lines(image.head);
    for (std::string line; std::getline(lines, line);) {
        if (line.ends_with('\r'))
            line.pop_back();
        if (!line.starts_with(name))
            continue;
        std::string version = line.substr(name.size());
        if (!version.empty() && version.size() <= 32 && version.find_first_not_of(characters) == version.npos)
            return version;
    }
    return "";
}

} // namespace

Json::Value update_flash(State& state, const Json::Value& request)
{
    const Json::Value& address = request["indexStr"];
    const Json::Value& file = request["file"];
    if (!address.isString() || !file.isString())
        return error_answer(Error_Code::REQUEST, "indexStr and file must be texts");
    return answer_at(
        state.inventory.adapter_at(address.asString()), address, [&](const Inventory::Place& place) {
            const Image image = read_image(file.asString());
            if (!image.problem.empty())
                return refusal(UNREADABLE, "cannot read " + file.asString() + ": " + image.problem);
            if (image.head.empty())
                return refusal(NO_IMAGE, file.asString() + " is empty");
            const Json::Value& outcome = place.adapter->flash_update;
            const std::string version = version_of(image);
            Json::Value& firmware = place.adapter->data["firmware"];
            const bool is_done = outcome["status"].asUInt() == 0;
            if (is_done && firmware.isObject() && !version.empty())
                firmware["version"] = version;
            if (is_done)
                occur(state, Occurrence::FLASH_UPDATED, *place.adapter);
            return update_answer(outcome["status"], outcome["message"].asString());
        });
}

} // namespace KPRV::simulator
