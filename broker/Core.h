#pragma once

#include "broker/Call_Log.h"
#include "broker/Ledger.h"
#include "broker/Object.h"
#include "broker/Object_Blocks.h"
#include "broker/Server_Options.h"
#include "broker/Violations.h"
#include "broker/values/Class_Catalogue.h"
#include "contracts/cmpi/cmpift.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <deque>
#include <functional>

namespace KPRV::broker {

/// What the objects and the broker of one server share. Lives as long as the last thread that is inside a
/// call.
class Core
{
public:
    explicit Core(Server_Options server_options)
        : options(std::move(server_options)), blocks(options.most_object_memory)
    {
    }
    ~Core();
    Core(const Core&) = delete;
    Core& operator=(const Core&) = delete;

    const Server_Options options;
    Violations violations;
    Ledger ledger;
    Call_Log calls;
    Object_Blocks blocks;
    /// Set before the first call, never changed later.
    const Class_Catalogue* catalogue = nullptr;

    /// Makes its address known, and counts it unless it is the server's own.
    void adopt(Object& object);

    /// Ends the object's life: its content goes at once, its shell is kept for a while so that a later use is
    /// seen and not a crash.
    void retire(Object& object);

    /// What the object holds takes less memory then, until it is found by its address.
    void pack(Object& object);
    void unpack(Object& object);

private:
    Standard_Mutex<> _mutex;
    std::deque<Object*> _retired GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
