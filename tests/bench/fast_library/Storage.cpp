#include "tests/bench/fast_library/Storage.h"

#include <cstdio>

namespace KPRV::bench {

namespace {

/// Addresses that differ in their last four bytes.
std::string address(const char* prefix, unsigned number)
{
    char text[32];
    snprintf(text, sizeof text, "%s:%02x:%02x:%02x:%02x", prefix, number >> 24 & 255, number >> 16 & 255,
             number >> 8 & 255, number & 255);
    return text;
}

Json::Value list()
{
    Json::Value answer;
    answer["indexStrings"] = Json::Value(Json::arrayValue);
    return answer;
}

} // namespace

Storage::Storage(const Storage_Size& size) : adapters(list()), adapter_count(size.adapters)
{
    for (unsigned a = 0; a < size.adapters; a++) {
        const std::string adapter = address("10:00:8c:7c", a);
        adapters["indexStrings"].append(adapter);
        add_adapter(adapter, size);
        Json::Value ports = list();
        for (unsigned p = 0; p < size.ports; p++) {
            const std::string port = address("20:00:8c:7c", a * size.ports + p);
            ports["indexStrings"].append(port);
            add_port(port, size);
        }
        _ports_of[adapter] = ports;
    }
}

void Storage::add_adapter(const std::string& wwn, const Storage_Size& size)
{
    Json::Value adapter;
    Json::Value& data = adapter["hbaData"];
    data["wwn"] = wwn;
    data["portCount"] = size.ports;
    data["hbaStatus"] = true;
    data["model"] = "825";
    data["serialNumber"] = "KLDR00A" + wwn.substr(18, 2) + wwn.substr(21, 2);
    data["oem"] = "KLDR";
    data["oemSerialNum"] = "";
    data["partNum"] = "KF-0825";
    data["fruNum"] = "FRU-0825";
    data["uuid"] = "";
    adapter["driver"]["storageDriverName"] = "kldrfc";
    adapter["driver"]["storageDriverVersion"] = "3.2.1.0";
    adapter["firmware"]["version"] = "3.2.1.0";
    _adapters[wwn] = adapter;
}

void Storage::add_port(const std::string& wwn, const Storage_Size& size)
{
    Json::Value port;
    port["wwn"] = wwn;
    port["nodeWwn"] = "30" + wwn.substr(2);
    port["PortSymbolicName"] = "FC HBA | 3.2.1.0 | host.example.com | Linux";
    port["portStatusValue"] = 11;
    port["portTypeMOFValue"] = 10;
    port["maxFrameSize"] = 2112;
    port["operatingSpeed"] = 16;
    port["supportedPortSpeeds"].append(16);
    port["supportedPortSpeeds"].append(8);
    Json::Value remotes(Json::arrayValue);
    for (unsigned t = 0; t < size.targets; t++) {
        const std::string remote =
            address("50:06:01:60", static_cast<unsigned>(_ports.size()) * size.targets + t);
        Json::Value element;
        element["remotePortWwn"] = remote;
        remotes.append(element);
        add_remote_port(remote, size.luns);
    }
    _remote_ports_of[wwn] = remotes;
    _ports[wwn] = port;
}

void Storage::add_remote_port(const std::string& wwn, unsigned luns)
{
    Json::Value remote;
    remote["deviceData"]["isTarget"] = true;
    remote["deviceData"]["stateMofValue"] = 11;
    remote["deviceData"]["type"] = "Disk";
    remote["lunList"] = Json::Value(Json::arrayValue);
    for (unsigned n = 0; n < luns; n++) {
        Json::Value lun;
        lun["number"] = n;
        lun["vendor"] = "ACME";
        lun["productID"] = "Array 9000";
        lun["lunDescIdType"] = 3;
        lun["lunDescription"] =
            "60060160" + std::to_string(10000000 + n) + wwn.substr(12, 2) + wwn.substr(15, 2);
        remote["lunList"].append(lun);
    }
    _remote_ports[wwn] = remote;
}

const Json::Value& Storage::find(const Answers& answers, const Json::Value& address)
{
    const char* begin = nullptr;
    const char* end = nullptr;
    if (!address.isString() || !address.getString(&begin, &end))
        return Json::Value::nullSingleton();
    const auto found = answers.find(std::string(begin, end));
    return found == answers.end() ? Json::Value::nullSingleton() : found->second;
}

} // namespace KPRV::bench
