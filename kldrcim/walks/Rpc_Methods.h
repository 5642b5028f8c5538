#pragma once

#include <string>
#include <vector>

namespace KPRV::kldrcim {

enum class Rpc_Type
{
    STRING,
    INTEGER,
    BOOLEAN,
    ARRAY,
    OBJECT,
};

/// "string", "integer", ...
const char* rpc_type_name(Rpc_Type type);

struct Rpc_Parameter
{
    std::string name;
    Rpc_Type type;
};

/// A remote procedure of the agent, as its table (contracts/agent/Methods.def) tells it.
struct Rpc_Method
{
    std::string name;
    /// By position.
    std::vector<Rpc_Parameter> parameters;
};

/// All of them, in the table's order.
const std::vector<Rpc_Method>& rpc_methods();

/// Null for one that the table does not have; the agent may have it all the same.
const Rpc_Method* find_rpc_method(const std::string& name);

} // namespace KPRV::kldrcim
