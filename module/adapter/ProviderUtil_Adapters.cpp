// Of `ProviderUtil`, what asks the library for its adapters: which there are, and what one is.
#include "module/adapter/Adapter_List.h"
#include "module/adapter/Ethernet_Port_Query.h"
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/adapter/ProviderUtil_Log.h"
#include "module/adapter/Serial_Number.h"

#include <cstring>

namespace KPRV {

namespace {

constexpr uint32 MAC_INDEX_SIZE = 17;

/// What a failed reading of an answer is told as: its member was of the wrong type, which is the entry
/// point's doing.
Guarded_Entry adapter_entry(const String& address)
{
    return {"libGetHbaByWwn", address.c_str()};
}

/// A boolean of `hbaData`. None if the adapter is unknown, or if it lacks the member, which is told with the
/// words.
std::optional<bool> adapter_flag(const String& address, const char* name, const char* failure)
{
    Json::Value adapter;
    if (ProviderUtil::getAdapterDetails(address, adapter) != 0)
        return std::nullopt;
    const Json::Value& hba_data = member(adapter, "hbaData");
    if (hasMember(hba_data, name))
        return asBool(member(hba_data, name));
    UTIL_LOG(ERR, "%s %s", failure, address.c_str());
    return std::nullopt;
}

} // namespace

int ProviderUtil::getNumberOfAdapters(Json::Value& out)
{
    UTIL_SCOPE("getNumberOfAdapters");
    const Json::Value* list = query_adapter_list(UTIL_HERE, out);
    if (!list)
        return -1;
    const int count = static_cast<int>(list->size());
    UTIL_LOG(INFO, "Number of Adapters: %d", count);
    return count;
}

String ProviderUtil::getAddrByAdapterId(int id)
{
    UTIL_SCOPE("getAddrByAdapterId");
    Json::Value response;
    const Json::Value* list = query_adapter_list(UTIL_HERE, response);
    if (!list || list->empty())
        return String();
    const unsigned wanted = static_cast<unsigned>(id);
    if (id < 1 || wanted > list->size()) {
        UTIL_LOG(INFO, "numOfAdapters = %u. Id = %u", list->size(), wanted);
        return String();
    }
    return adapter_address(UTIL_HERE, *list, wanted - 1);
}

int ProviderUtil::getAdapterDetails(const String& address, Json::Value& out)
{
    UTIL_SCOPE("getAdapterDetails");
    out = Json::Value();
    // The index form is made inside the guard, so that an address of one character is a failed lookup, too.
    const bool answered = guarded(UTIL_HERE, adapter_entry(address), [&] {
        const String index = getIndexInColonFormat(address);
        Json::Value request(Json::objectValue);
        request[index.size() == MAC_INDEX_SIZE ? "mac" : "wwn"] = index.c_str();
        out = libGetHbaByWwn(request);
    });
    if (!answered)
        return -1;
    if (isValidJsonResponse(out) && hasMember(out, "hbaData") && hasMember(out, "driver"))
        return 0;
    UTIL_LOG(ERR, "Unable to get adapater details for %s", address.c_str());
    return -1;
}

String ProviderUtil::getAdapterSerialNumber(const String& address)
{
    UTIL_SCOPE("getAdapterSerialNumber");
    Json::Value adapter;
    if (getAdapterDetails(address, adapter) != 0) {
        if (isValidJsonResponse(adapter))
            UTIL_LOG(ERR, "Unable to get Adapter info for %s", address.c_str());
        else
            UTIL_LOG(ERR, "adapter info is NULL or has errors for %s", address.c_str());
        return String();
    }
    String serial;
    guarded(UTIL_HERE, adapter_entry(address), [&] {
        const Json::Value& hba_data = member(adapter, "hbaData");
        const auto oem = oem_serial_number(hba_data);
        serial = (oem ? *oem : asString(member(hba_data, "serialNumber"))).c_str();
    });
    return serial;
}

bool ProviderUtil::isCNA(const String& address)
{
    UTIL_SCOPE("isCNA");
    return adapter_flag(address, "isCNA", "Unable to get CNA info for").value_or(false);
}

bool ProviderUtil::hasEthernetPort(const String& address)
{
    UTIL_SCOPE("hasEthernetPort");
    const auto has = adapter_flag(address, "hasEthPort", "Unable to get Ethernet info");
    if (has)
        UTIL_LOG(INFO, "ethFlag = %d", *has);
    return has.value_or(false);
}

String ProviderUtil::getDriverVersion()
{
    UTIL_SCOPE("getDriverVersion");
    constexpr size_t SIZE = 64;
    const String address = getAddrByAdapterId(1);
    Json::Value adapter;
    if (address.empty() || getAdapterDetails(address, adapter) != 0)
        return String();

    const Json::Value& driver = member(adapter, "driver");
    const char* name =
        hasMember(driver, "storageDriverVersion") ? "storageDriverVersion" : "networkDriverVersion";
    if (!hasMember(driver, name)) {
        UTIL_LOG(ERR, "Unable to get driver version for %s", address.c_str());
        return String();
    }
    String version;
    guarded(UTIL_HERE, adapter_entry(address), [&] {
        const std::string text = asString(driver[name]);
        const std::string_view kept = trimmed(text.c_str()).substr(0, SIZE - 1);
        version = String(kept.data(), kept.size());
        UTIL_LOG(INFO, "Driver version is %s", version.c_str());
    });
    return version;
}

int ProviderUtil::checkIfThisAdapterModelPresent(const char* model)
{
    // Spelt so in the log.
    UTIL_SCOPE("checkIfThisAdapterModalPresent");
    Json::Value response;
    const int count = getNumberOfAdapters(response);
    if (count < 1) {
        UTIL_LOG(WARN, "No adapters in the system!");
        return 0;
    }
    const Json::Value& list = response["indexStrings"];
    for (int i = 0; i < count; i++) {
        const String address = adapter_address(UTIL_HERE, list, static_cast<unsigned>(i));
        Json::Value adapter;
        if (getAdapterDetails(address, adapter) != 0) {
            UTIL_LOG(INFO, "Unable to get Adapter info %d - %s", i + 1, address.c_str());
            continue;
        }
        // The adapter's model decides how much of the text is compared, so one without a model matches
        // everything.
        bool found = false;
        guarded(UTIL_HERE, adapter_entry(address), [&] {
            const std::string own = asString(member(member(adapter, "hbaData"), "model"));
            found = strncasecmp(model, own.c_str(), strlen(own.c_str())) == 0;
        });
        if (found) {
            UTIL_LOG(INFO, "Found the Adapter");
            return 1;
        }
    }
    return 0;
}

int ProviderUtil::getAdapterIdByIndexStr(const String& address)
{
    UTIL_SCOPE("getAdapterIdByIndexStr");
    Json::Value request(Json::objectValue);
    request["indexStr"] = getIndexInColonFormat(address).c_str();
    const Json::Value response = libGetAdapterId(request);
    int id = -1;
    if (isValidJsonResponse(response) && hasMember(response, "adapterId"))
        guarded(UTIL_HERE, {"libGetAdapterId"},
                [&] { id = static_cast<int>(asUInt(response["adapterId"])); });
    else
        UTIL_LOG(ERR, "libGetAdapterId returns NULL.");
    return id;
}

int ProviderUtil::getAdapterId(const String& address)
{
    UTIL_SCOPE("getAdapterId");
    switch (address.size()) {
    case 16:
        return getAdapterIdByNWWN(address);
    case 12:
        return getAdapterIdByMacAddr(address);
    default:
        UTIL_LOG(ERR, "The address passed is not MAC or WWN");
        return -1;
    }
}

String ProviderUtil::getEthDeviceNameByMAC(const String& mac)
{
    UTIL_SCOPE("getEthDeviceNameByMAC");
    Json::Value port;
    String device;
    bool named = false;
    if (query_ethernet_port(UTIL_HERE, mac, port) == 0) {
        const Json::Value& data = member(port, "ethData");
        if (hasMember(data, "ethDev"))
            named = guarded(UTIL_HERE, {"libGetEthPortByEthMac", mac.c_str()},
                            [&] { device = asString(data["ethDev"]).c_str(); });
    }
    if (!named)
        UTIL_LOG(ERR, "Unable to get Eth Device Name for %s", mac.c_str());
    return device;
}

} // namespace KPRV
