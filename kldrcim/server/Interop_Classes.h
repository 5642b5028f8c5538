#pragma once

#include "broker/values/Class_Catalogue.h"

#include <deque>

namespace KPRV::kldrcim {

using namespace broker;

/// The classes of the interop name space: those of the module's catalogue, and those of subscriptions, which
/// the module has no use for.
class Interop_Classes final : public Class_Catalogue
{
public:
    /// The catalogue must outlive it.
    explicit Interop_Classes(const Class_Catalogue& others);

    std::vector<std::string> class_names() const override;
    const Class_Info* find(std::string_view name) const override;
    std::string module_name() const override { return _others.module_name(); }

private:
    const Class_Catalogue& _others;
    std::deque<Class_Info> _own;
};

} // namespace KPRV::kldrcim
