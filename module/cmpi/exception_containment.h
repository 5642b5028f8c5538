#pragma once

#include "module/cmpi/CMPI_Static_Data.h"
#include "module/runtime/dispatch/Registration.h"

// What stands between a server and the entries of the module, chosen by the CMake option
// KLDR_CONTAIN_EXCEPTIONS: nothing, so that an exception goes on into the server, or a catch around each
// entry.
//
// How it works. Both forms are compiled from one source, and the module is linked with one. The containing
// form walks the tables of a provider after they were filled, and puts in the place of each entry a function
// that a template makes for its type: it calls the entry, of a table that all providers share, inside a
// `try`. What is caught becomes a status; its text is made on the stack, since memory may be what ran out. A
// thread that ends or is cancelled unwinds by an exception that must not be caught for good: it is told apart
// by the standard's own means and goes on. Factories have no table: `create_mi` is their frame.

namespace KPRV {

/// Called with filled tables. In a build that contains exceptions each entry is exchanged for one that ends
/// with `CMPI_RC_ERR_FAILED` where the former would throw; the message of the status, a string of the
/// server's, reads "getInstance: text of the exception" or "invokeMethod(SetAlarmState): text", in at most
/// 1023 bytes, and is null where the server has no room for it. The scopes of the entry have ended by then.
/// The unwinding of a thread that is cancelled or exits passes in any build.
void contain_exceptions(CMPI_Static_Data& data);

/// The MI of a kind for an exported factory: `cimple_cmpi_adapter` with its arguments. Null for an unknown
/// kind. In a build that contains exceptions also for a provider that throws: `status` then tells, as above
/// and by the provider's name; it may be null, and is left alone otherwise. Owned by the static area.
void* create_mi(void* static_data, const Registration* registration, const CMPIBroker* broker,
                const CMPIContext* context, const char* provider_name, char mi_kind, CMPIStatus* status);

} // namespace KPRV
