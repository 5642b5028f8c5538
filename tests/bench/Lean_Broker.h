#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace KPRV::bench {

/// The cheapest server that a provider can be called by, so that what is measured is the provider: objects
/// are cut from one block without a call of the allocator, texts are copied once, names are kept by pointer,
/// nothing is checked, and no result leaves the process. The block is used in a circle, with room for some
/// thousand results, unless the results are to be kept for comparison.
class Lean_Broker
{
public:
    /// The only one: a module keeps the broker that it was opened with.
    static Lean_Broker& get();

    Lean_Broker(const Lean_Broker&) = delete;
    Lean_Broker& operator=(const Lean_Broker&) = delete;

    /// Called with each delivered indication, on the thread that delivers it.
    void (*on_indication)() = nullptr;
    /// Who serves a class that a provider asks the server for.
    CMPIInstanceMI* (*provider_of)(const char* class_name) = nullptr;

    const CMPIBroker* broker() const { return &_broker; }
    const CMPIContext* context() const { return &_context; }
    const CMPIResult* result() const { return &_result; }

    /// Forgets all objects and results. With `keep`, the next call's results can be read by `texts`.
    void begin_call(bool keep = false);
    /// Objects returned since then.
    size_t delivered() const { return _delivered; }
    /// A result that is no CIM object.
    void deliver(const char* text);
    /// The kept results in order: class, keys and properties with their types, sorted by name.
    std::vector<std::string> texts() const;
    const std::vector<const CMPIInstance*>& instances() const { return _instances; }
    const std::vector<const CMPIObjectPath*>& paths() const { return _paths; }

    /// Objects for requests. They live until `begin_call`.
    CMPIObjectPath* path(const char* class_name);
    void add_key(CMPIObjectPath* path, const char* name, const char* text);
    /// A key that is itself a path.
    void add_key(CMPIObjectPath* path, const char* name, CMPIObjectPath* target);
    CMPIArgs* args();
    void add_argument(CMPIArgs* args, const char* name, const char* text);
    /// The characters of a text argument; null if there is none of that name.
    static const char* text_argument(const CMPIArgs* args, const char* name);

    /// For the function tables.
    void* allocate(size_t size);
    void deliver(const CMPIInstance* instance);
    void deliver(const CMPIObjectPath* path);
    void fetched(const CMPIInstance* instance) { _fetched = instance; }
    /// The instance as its provider gives it, in a request of its own; null if it does not.
    CMPIInstance* fetch(const CMPIObjectPath* path, const char** properties);

    static constexpr const char* NAME_SPACE = "root/kaldera";

private:
    Lean_Broker();

    CMPIBroker _broker;
    CMPIContext _context;
    CMPIResult _result;
    CMPIResult _fetching;
    const CMPIInstance* _fetched = nullptr;

    std::vector<std::unique_ptr<char[]>> _blocks;
    char* _next = nullptr;
    char* _end = nullptr;
    bool _keep = false;
    size_t _delivered = 0;
    std::vector<const CMPIInstance*> _instances;
    std::vector<const CMPIObjectPath*> _paths;
    std::vector<std::string> _texts;
};

} // namespace KPRV::bench
