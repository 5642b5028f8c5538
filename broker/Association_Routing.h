#pragma once

#include "broker/values/Class_Catalogue.h"
#include "broker/values/Request.h"

#include <unordered_set>

namespace KPRV::broker {

/// True for associators, references and their names.
bool is_association_operation(Operation operation);

/// The association class that the request names: `association_class`, or the result class of references.
/// Empty if it names none.
const std::string& named_association(const Request& request);

/// The association classes that a CIM server asks for the request, in the order of the catalogue: the named
/// one and its subclasses, or, if none is named, each class with a reference that can hold the class of the
/// path. Whether they have a provider is not looked at.
std::vector<std::string> association_classes(const Class_Catalogue& catalogue, const Request& request);

/// Adds what one provider answered to what others did. An object that several report is kept once. A failed
/// answer is noted in `failures`; the sum fails only if `settle` finds that nobody succeeded.
class Association_Merge
{
public:
    void add(const std::string& provider_class, Result one);
    /// The sum. If all providers failed, with the status of the first.
    Result settle();

private:
    bool is_new(const Path_Value& path);

    Result sum_;
    std::optional<Result> first_failure_;
    bool succeeded_ = false;
    std::unordered_set<std::string> seen_;
};

} // namespace KPRV::broker
