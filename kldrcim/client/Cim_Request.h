#pragma once

#include "broker/values/Request.h"
#include "kldrcim/client/Http_Client.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The name of the operation, or method, that a request is.
std::string wire_name(const Request& request);

/// The message that asks for it; the path has a name space.
Http_Message write_request(const Request& request);

/// Those that ask for classes: all of a name space, or one.
Http_Message write_class_names_request(const std::string& name_space);
Http_Message write_class_request(const std::string& name_space, const std::string& class_name);

} // namespace KPRV::kldrcim
