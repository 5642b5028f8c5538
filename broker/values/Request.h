#pragma once

#include "broker/values/Plain_Value.h"

#include <optional>

namespace KPRV::broker {

/// Absent: all properties.
using Property_List = std::optional<std::vector<std::string>>;

enum class Operation
{
    ENUMERATE_INSTANCE_NAMES,
    ENUMERATE_INSTANCES,
    GET_INSTANCE,
    CREATE_INSTANCE,
    MODIFY_INSTANCE,
    DELETE_INSTANCE,
    INVOKE_METHOD,
    ASSOCIATORS,
    ASSOCIATOR_NAMES,
    REFERENCES,
    REFERENCE_NAMES,
};

/// The filters of an association call; empty ones do not filter. For references, `result_class` and `role`
/// count.
struct Association_Filter
{
    std::string association_class = {};
    std::string result_class = {};
    std::string role = {};
    std::string result_role = {};
};

/// One CIM operation, from a client or from a provider's up-call.
struct Request
{
    Operation operation = Operation::ENUMERATE_INSTANCES;
    Path_Value path;
    Property_List properties = {};
    Instance_Value instance = {};
    std::string method = {};
    std::vector<Named_Value> in = {};
    Association_Filter filter = {};
    /// Entries of the CMPI context.
    std::vector<Named_Value> context = {};
    /// Keys of a client's path travel as text and lose their width; those of an up-call do not.
    bool from_client = true;
};

/// True for associators, references and their names.
bool is_association_operation(Operation operation);

/// The association class that the request names: `association_class`, or the result class of references.
/// Empty if it names none.
const std::string& named_association(const Request& request);

/// A provider that failed while a request went to several.
struct Provider_Failure
{
    std::string provider_class;
    CMPIrc rc;
    std::string message;
};

/// The answer: plain values, which outlive the call. Instances and paths that went to a receiver are not in
/// it.
struct Result
{
    CMPIrc rc = CMPI_RC_OK;
    /// Message of the status, empty without one.
    std::string message = {};
    std::vector<Instance_Value> instances = {};
    std::vector<Path_Value> paths = {};
    /// Of a method; type 0 and null if the provider returned none.
    Plain_Value return_value = {};
    /// Out parameters of a method.
    std::vector<Named_Value> out = {};
    /// How often the provider called `CMReturnDone`, summed over all providers that were asked.
    unsigned done_count = 0;
    bool done = false;
    /// Text of an exception that left the provider; rc is 1 then.
    std::optional<std::string> exception = {};
    /// The receiver has had enough.
    bool stopped = false;
    /// Of an association request: the providers that failed. If others succeeded, rc is 0.
    std::vector<Provider_Failure> failures = {};

    bool ok() const { return rc == CMPI_RC_OK; }
};

} // namespace KPRV::broker
