#pragma once

#include <netdb.h>
#include <sys/utsname.h>

#include <cstddef>

namespace KPRV {

/// What the toolbox asks the operating system about the host. The C library's functions, until a test puts
/// its own in their place.
struct Host_Calls
{
    int (*gethostname)(char* name, size_t size);
    int (*getdomainname)(char* name, size_t size);
    int (*gethostbyname_r)(const char* name, hostent* entry, char* room, size_t size, hostent** found,
                           int* error);
    int (*uname)(utsname* name);
};

extern Host_Calls host_calls;

} // namespace KPRV
