#pragma once

#include "broker/values/Class_Catalogue.h"
#include "broker/values/Receiver.h"
#include "broker/values/Request.h"

#include <unordered_set>

namespace KPRV::broker {

/// The association classes that a CIM server asks for the request, in the order of the catalogue: the named
/// one and its subclasses, or, if none is named, each class with a reference that can hold the class of the
/// path. Whether they have a provider is not looked at.
std::vector<std::string> association_classes(const Class_Catalogue& catalogue, const Request& request);

/// Adds what one provider answered to what others did. An object that several report is kept once. A failed
/// answer is noted in `failures`; the sum fails only if `settle` finds that nobody succeeded.
class Association_Merge final : private Receiver
{
public:
    /// With a receiver, objects are not kept: those that nobody has reported before go to it as they come,
    /// also those of a provider that fails later.
    explicit Association_Merge(Receiver* receiver = nullptr) : _receiver(receiver) {}

    /// Where the provider that is asked next hands its objects to; null where they come in its answer.
    Receiver* taker() { return _receiver ? this : nullptr; }
    void add(const std::string& provider_class, Result one);
    bool is_stopped() const { return _sum.stopped; }
    /// The sum. If all providers failed, with the status of the first.
    Result settle();

private:
    bool instance(Instance_Value&& instance) override;
    bool path(Path_Value&& path) override;
    bool is_new(const Path_Value& path);

    Receiver* const _receiver;
    Result _sum;
    std::optional<Result> _first_failure;
    bool _succeeded = false;
    std::unordered_set<std::string> _seen;
};

} // namespace KPRV::broker
