// Every entry point of the adapter library, answering nothing: what a benchmark needs is defined elsewhere
// and takes the place of these.

#include "module/adapter/CIMProviderZntj.h"

#pragma GCC visibility push(default)
extern "C" {
#define DEFINE_JsonReqFP(symbol)                                                                             \
    [[gnu::weak]] Json::Value symbol(const Json::Value&)                                                     \
    {                                                                                                        \
        return {};                                                                                           \
    }
#define DEFINE_voidRetStrFP(symbol)                                                                          \
    [[gnu::weak]] const char* symbol()                                                                       \
    {                                                                                                        \
        return nullptr;                                                                                      \
    }
#define DEFINE_voidRetUIntFP(symbol)                                                                         \
    [[gnu::weak]] KPRV::uint32 symbol()                                                                      \
    {                                                                                                        \
        return 0;                                                                                            \
    }
#define DEFINE_voidRetIntFP(symbol)                                                                          \
    [[gnu::weak]] KPRV::sint32 symbol()                                                                      \
    {                                                                                                        \
        return 0;                                                                                            \
    }
#define DEFINE_evtProcessCBRetVoidFP(symbol)                                                                 \
    [[gnu::weak]] void symbol(KPRV::evtProcessCB) {}
#define DEFINE_log4cxxMsgRetVoidFP(symbol)                                                                   \
    [[gnu::weak]] void symbol(KPRV::log4cxxMsgCB) {}
#define ENTRY_POINT(symbol, variable, signature) DEFINE_##signature(symbol)
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
}
#pragma GCC visibility pop
