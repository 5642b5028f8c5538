#pragma once

#include "module/adapter/Host_Calls.h"

#include <arpa/inet.h>

namespace KPRV {

/// A name that nobody knows, for `gethostbyname_r`.
inline int find_no_host(const char*, hostent*, char*, size_t, hostent** found, int* error)
{
    *found = nullptr;
    *error = HOST_NOT_FOUND;
    return 0;
}

/// A host with the address 10.0.0.1, for a scope.
class Fixed_Host
{
public:
    Fixed_Host()
    {
        host_calls.gethostname = [](char* name, size_t) {
            name[0] = 'h';
            name[1] = '\0';
            return 0;
        };
        host_calls.gethostbyname_r = [](const char*, hostent*, char*, size_t, hostent** found, int*) {
            static in_addr address = {inet_addr("10.0.0.1")};
            static char* addresses[] = {reinterpret_cast<char*>(&address), nullptr};
            static hostent entry = {nullptr, nullptr, AF_INET, sizeof address, addresses};
            *found = &entry;
            return 0;
        };
    }
    ~Fixed_Host() { host_calls = _old; }
    Fixed_Host(const Fixed_Host&) = delete;
    Fixed_Host& operator=(const Fixed_Host&) = delete;

private:
    const Host_Calls _old = host_calls;
};

} // namespace KPRV
