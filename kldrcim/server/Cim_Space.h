#pragma once

#include "broker/Local_Server.h"

namespace KPRV::kldrcim {

using namespace broker;

/// What a client finds in a name space.
class Cim_Space
{
public:
    virtual ~Cim_Space() = default;

    /// As it is written in paths.
    virtual const std::string& name() const = 0;
    virtual const Class_Catalogue& classes() const = 0;
    /// An operation of a client. The path is that of this name space.
    virtual Result run(Request request, Receiver* receiver) = 0;
};

/// The name space of the module's classes.
class Broker_Space final : public Cim_Space
{
public:
    explicit Broker_Space(Local_Server& server) : _server(server) {}

    const std::string& name() const override { return _server.options().name_space; }
    const Class_Catalogue& classes() const override { return _server.catalogue(); }
    Result run(Request request, Receiver* receiver) override;

private:
    Local_Server& _server;
};

/// A status with its text.
Result failed(CMPIrc rc, std::string message);

/// Keeps what is handed over: a result where somebody wants all of it at once.
class Collector final : public Receiver
{
public:
    bool instance(Instance_Value&& instance) override
    {
        instances.push_back(std::move(instance));
        return true;
    }
    bool path(Path_Value&& path) override
    {
        paths.push_back(std::move(path));
        return true;
    }

    std::vector<Instance_Value> instances;
    std::vector<Path_Value> paths;
};

} // namespace KPRV::kldrcim
