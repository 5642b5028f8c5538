#pragma once

#include "tests/bench/Lean_Objects.h"

#include <unordered_map>
#include <vector>

namespace KPRV::bench {

/// What a request delivered, kept as data that are ready to be handed over again: nobody could give the same
/// objects to the server with less than these calls.
class Ready_Objects
{
public:
    /// Of what the server has kept since `begin_call(true)`.
    explicit Ready_Objects(const Lean_Broker& server);
    Ready_Objects(const Ready_Objects&) = delete;
    Ready_Objects& operator=(const Ready_Objects&) = delete;

    size_t size() const { return _deliveries.size(); }
    /// Makes each object and returns it. A path that several objects have in common is made once, as it was.
    void hand_over(Lean_Broker& server) const;
    /// The path of one of them, for a request.
    CMPIObjectPath* path(Lean_Broker& server, size_t place) const;

private:
    struct Datum
    {
        const char* name;
        CMPIType type;
        CMPIValue value;                  ///< But of texts, moments, arrays and references.
        const char* text = nullptr;       ///< Of a text or a moment.
        std::vector<Datum> elements = {}; ///< Of an array.
        size_t path = 0;                  ///< Of a reference.
    };
    struct Path
    {
        const char* class_name;
        std::vector<Datum> keys;
    };
    struct Delivery
    {
        size_t path;
        size_t paths_end; ///< The paths before it are made first.
        bool is_instance;
        std::vector<Datum> properties;
    };

    size_t take_path(const CMPIObjectPath* path);
    std::vector<Datum> take(const Bag& bag);
    Datum take(const char* name, CMPIType type, const CMPIValue& value);
    CMPIValue make(Lean_Broker& server, const Datum& datum) const;
    void make_path(Lean_Broker& server, size_t place) const;
    void make_with_ends(Lean_Broker& server, size_t place) const;

    std::vector<Path> _paths;
    std::vector<Delivery> _deliveries;
    std::unordered_map<const CMPIObjectPath*, size_t> _places;
    mutable std::vector<CMPIObjectPath*> _made;
};

} // namespace KPRV::bench
