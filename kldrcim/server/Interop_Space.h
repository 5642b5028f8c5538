#pragma once

#include "kldrcim/server/Cim_Space.h"
#include "kldrcim/server/Interop_Classes.h"

namespace KPRV::kldrcim {

/// Objects of the server itself, in the interop name space.
class Interop_Objects
{
public:
    virtual ~Interop_Objects() = default;

    /// True for a class that these objects are of.
    virtual bool owns(std::string_view class_name) const = 0;
    virtual std::vector<Instance_Value> instances() const = 0;
    virtual Result create(Instance_Value instance) = 0;
    virtual Result modify(const Instance_Value& instance, const Property_List& properties) = 0;
    virtual Result remove(const Path_Value& path) = 0;
};

/// The server and its name spaces: what a client finds before it knows where the classes are. They are not to
/// be changed.
class Server_Objects final : public Interop_Objects
{
public:
    Server_Objects(const std::string& host_name, const std::string& version,
                   const std::vector<std::string>& name_spaces);

    const Instance_Value& object_manager() const { return _instances.front(); }

    bool owns(std::string_view class_name) const override;
    std::vector<Instance_Value> instances() const override { return _instances; }
    Result create(Instance_Value) override;
    Result modify(const Instance_Value&, const Property_List&) override;
    Result remove(const Path_Value&) override;

private:
    std::vector<Instance_Value> _instances;
};

/// The interop name space under one of its names: the server's own objects, and the registered profiles of
/// the module, whose associations lead into the name space of its classes.
class Interop_Space final : public Cim_Space
{
public:
    Interop_Space(std::string name, const Interop_Classes& classes, std::vector<Interop_Objects*> objects,
                  Broker_Space& model);

    const std::string& name() const override { return _name; }
    const Class_Catalogue& classes() const override { return _classes; }
    Result run(Request request, Receiver* receiver) override;

private:
    friend class Moved_Objects;

    bool is_profile(std::string_view class_name) const;
    bool is_shown_here(std::string_view class_name) const;
    Interop_Objects* owner_of(std::string_view class_name) const;
    Result enumerate(const Request& request, Receiver& receiver);
    Result get(const Request& request, Receiver& receiver);
    Result traverse(const Request& request, Receiver& receiver);
    /// To the module, and its answer as it looks from here.
    Result forward(Request request, Receiver& receiver);
    void move_in(Path_Value& path) const;
    void move_out(Path_Value& path) const;

    std::string _name;
    const Interop_Classes& _classes;
    std::vector<Interop_Objects*> _objects;
    Broker_Space& _model;
};

} // namespace KPRV::kldrcim
