#include "tests/bench/requests.h"

namespace KPRV::bench {

namespace {

/// A class that is enumerated, and asked for the last of its instances.
struct Subject
{
    const char* class_name;
    const char* one;
    const char* many;
    plain_operation* enumerate;
    plain_operation* get;
    /// The key of the last.
    std::string (*last)(const Storage_Size& size);
};

constexpr Subject adapters = {
    "KALDERA_PortController", "adapter",         "adapters",
    plain_enumerate_adapters, plain_get_adapter, last_adapter,
};
constexpr Subject fc_ports = {
    "KALDERA_FCPort", "FC port", "FC ports", plain_enumerate_fc_ports, plain_get_fc_port, last_fc_port,
};
constexpr Subject extents = {
    "KALDERA_StorageExtent", "extent", "extents", plain_enumerate_extents, plain_get_extent, last_extent,
};

void add_both(const Subject& subject, const Storage_Size& size, unsigned count)
{
    const std::string behind = "/" + std::to_string(count);
    for (const Twins& twins : {enumeration(std::string("B1 enumerate ") + subject.many + behind,
                                           subject.class_name, size, subject.enumerate),
                               get_instance(std::string("B2 get the last ") + subject.one + behind,
                                            subject.class_name, subject.last(size), size, subject.get)}) {
        check_equal(twins);
        add(twins);
    }
}

} // namespace

void add_instances(bool tiny)
{
    add_both(adapters, {.adapters = 1, .ports = 2}, 1);
    add_both(fc_ports, {.adapters = 1, .ports = 1}, 1);
    add_both(fc_ports, {.adapters = 1, .ports = 8}, 8);
    add_both(extents, {.adapters = 1, .ports = 2, .targets = 2, .luns = 2}, 8);
    if (tiny)
        return;
    add_both(adapters, {.adapters = 8, .ports = 2}, 8);
    add_both(adapters, {.adapters = 64, .ports = 2}, 64);
    add_both(fc_ports, {.adapters = 8, .ports = 8}, 64);
    add_both(fc_ports, {.adapters = 128, .ports = 8}, 1024);
    add_both(extents, {.adapters = 4, .ports = 2, .targets = 16, .luns = 16}, 2048);
    add_both(extents, {.adapters = 8, .ports = 2, .targets = 32, .luns = 32}, 16384);
}

} // namespace KPRV::bench
