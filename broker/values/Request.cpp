#include "broker/values/Request.h"

namespace KPRV::broker {

bool is_association_operation(Operation operation)
{
    return operation >= Operation::ASSOCIATORS;
}

const std::string& named_association(const Request& request)
{
    bool references =
        request.operation == Operation::REFERENCES || request.operation == Operation::REFERENCE_NAMES;
    return references ? request.filter.result_class : request.filter.association_class;
}

} // namespace KPRV::broker
