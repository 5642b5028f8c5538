#pragma once

#include "tests/bench/Storage_Size.h"

#include <json/value.h>

#include <string>
#include <string_view>
#include <unordered_map>

namespace KPRV::bench {

/// The answers about a host of one size, all made beforehand. What an answer holds is what is read of it, and
/// nothing else, so that copying it costs both twins as little as possible.
class Storage
{
public:
    explicit Storage(const Storage_Size& size);

    Json::Value adapters;
    unsigned adapter_count;

    /// Prepared answers by the address in the request; a null value for an unknown one.
    const Json::Value& adapter(const Json::Value& wwn) const { return find(_adapters, wwn); }
    const Json::Value& ports_of(const Json::Value& adapter) const { return find(_ports_of, adapter); }
    const Json::Value& port(const Json::Value& wwn) const { return find(_ports, wwn); }
    const Json::Value& remote_ports_of(const Json::Value& port) const { return find(_remote_ports_of, port); }
    const Json::Value& remote_port(const Json::Value& wwn) const { return find(_remote_ports, wwn); }

private:
    using Answers = std::unordered_map<std::string, Json::Value>;
    static const Json::Value& find(const Answers& answers, const Json::Value& address);
    void add_adapter(const std::string& wwn, const Storage_Size& size);
    void add_port(const std::string& wwn, const Storage_Size& size);
    void add_remote_port(const std::string& wwn, unsigned luns);

    Answers _adapters, _ports_of, _ports, _remote_ports_of, _remote_ports;
};

} // namespace KPRV::bench
