#pragma once

#include "contracts/adapter/Signatures.h"
#include "module/runtime/ground/Types.h"

#include <json/value.h>

namespace KPRV {

// The door to the adapters: one variable per entry point of the library "libdzntj.so", named lib<Name>. They
// are written once while the module loads and read without a lock from then on, by any thread; the library
// accepts concurrent calls. Without the library each one holds the stub of its class, so callers never ask
// whether it is there: a stub's answer counts as a failed one.

// The stubs of the signature classes.
/// Null.
Json::Value default_JsonReqFP(const Json::Value& request);
/// Does nothing. No entry point is of this class.
void default_JsonReqVoidFP(const Json::Value& request);
/// A null pointer.
const char* default_voidRetStrFP();
/// 65535.
uint32 default_voidRetUIntFP();
/// -1.
sint32 default_voidRetIntFP();
void default_evtProcessCBRetVoidFP(evtProcessCB callback);
void default_log4cxxMsgRetVoidFP(log4cxxMsgCB callback);

/// What the library was opened as; null when it could not be opened. It is never closed.
extern void* libHandle;
/// The library was opened.
extern bool gZntjLibLoaded;

#define ENTRY_POINT(symbol, variable, signature) extern signature variable;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT

/// Opens the library and fills all variables; called once, while the module loads. Nothing fails: an absent
/// library is told at DBG and leaves the stubs. A symbol that an opened library lacks is told at ERR and
/// leaves a null variable, which is called all the same: a library has all the symbols or is not one.
void setupDLLEntryPoints();

} // namespace KPRV
