#include "module/adapter/Host_Calls.h"

#include <unistd.h>

namespace KPRV {

constinit Host_Calls host_calls = {::gethostname, ::getdomainname, ::gethostbyname_r, ::uname};

} // namespace KPRV
