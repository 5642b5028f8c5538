#include "kldrcim/server/Cim_Space.h"

namespace KPRV::kldrcim {

Result failed(CMPIrc rc, std::string message)
{
    Result result;
    result.rc = rc;
    result.message = std::move(message);
    return result;
}

namespace {

bool is_served_below(const Class_Catalogue& classes, const std::string& class_name)
{
    for (const std::string& name : classes.class_names())
        if (classes.find(name)->has_provider && classes.is_a(name, class_name))
            return true;
    return false;
}

/// The first of the request's association and result class that there is not; empty if there is none.
std::string unknown_filter_class(const Class_Catalogue& classes, const Association_Filter& filter)
{
    for (const std::string* each : {&filter.association_class, &filter.result_class})
        if (!each->empty() && !classes.find(*each))
            return *each;
    return {};
}

} // namespace

Result Broker_Space::run(Request request, Receiver* receiver)
{
    const std::string class_name = request.path.class_name;
    if (classes().is_known() && !classes().find(class_name))
        return failed(CMPI_RC_ERR_INVALID_CLASS, class_name);
    if (is_association_operation(request.operation)) {
        const std::string unknown = unknown_filter_class(classes(), request.filter);
        if (classes().is_known() && !unknown.empty())
            return failed(CMPI_RC_ERR_INVALID_PARAMETER, "no class " + unknown);
        const std::string named = named_association(request);
        // A class that nobody serves has no instances, and that is an answer.
        if (classes().is_known() && !named.empty() && !is_served_below(classes(), named))
            return {};
    }
    const bool enumerates = request.operation == Operation::ENUMERATE_INSTANCES ||
                            request.operation == Operation::ENUMERATE_INSTANCE_NAMES;
    if (enumerates && classes().is_known() &&
        (classes().find(class_name)->is_indication || !is_served_below(classes(), class_name)))
        return {};
    return _server.run(std::move(request), receiver);
}

} // namespace KPRV::kldrcim
