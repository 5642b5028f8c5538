#pragma once

#include "broker/Server_Store.h"
#include "broker/values/Class_Catalogue.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Puts into the store what a JSON file says of the server's own name spaces, a list of entries of three
/// kinds:
///
///     [
///       {"namespace": "root/PG_InterOp", "class": "PG_ObjectManager", "superclass": "CIM_ObjectManager",
///        "properties": {"Name": "Server:1", "ElementName": "The Server"}},
///       {"namespace": "root/PG_InterOp", "class": "CIM_Namespace"},
///       {"namespace": "root/private", "refuses": "CIM_ERR_ACCESS_DENIED"}
///     ]
///
/// an instance; a class that is there without an instance; a name space that refuses every request. Values
/// are read as the class declares them, or its superclass where the class is none of the module's; the keys
/// among them make the path. False with `error`, "FILE:LINE: REASON" in one line, for what does not fit; the
/// store then holds the entries before that line.
bool read_server_instances(const std::string& file, const Class_Catalogue& catalogue, Server_Store& store,
                           std::string& error);

} // namespace KPRV::kldrcim
