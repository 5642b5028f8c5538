#include "module/runtime/dispatch/Request_Scope.h"

namespace KPRV {

static constinit thread_local Request_Scope* current_request = nullptr;

Request_Scope::Request_Scope() : _outermost(!current_request)
{
    if (_outermost)
        current_request = this;
}

Request_Scope::~Request_Scope()
{
    if (_outermost)
        current_request = nullptr;
}

Request_Scope* Request_Scope::current()
{
    return current_request;
}

} // namespace KPRV
