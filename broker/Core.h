#pragma once

#include "broker/Call_Log.h"
#include "broker/Host_Options.h"
#include "broker/Ledger.h"
#include "broker/Object.h"
#include "broker/Violations.h"
#include "broker/values/Class_Catalogue.h"
#include "contracts/cmpi/cmpift.h"
#include "module/runtime/Standard_Mutex.h"

#include <deque>
#include <functional>

namespace KPRV::broker {

/// What the objects and the broker of one host share. Lives as long as the last thread that is inside a call.
class Core
{
public:
    explicit Core(Host_Options host_options) : options(std::move(host_options)) {}
    ~Core();
    Core(const Core&) = delete;
    Core& operator=(const Core&) = delete;

    const Host_Options options;
    Violations violations;
    Ledger ledger;
    Call_Log calls;
    /// Set before the first call, never changed later.
    const Class_Catalogue* catalogue = nullptr;

    /// Takes the object over: puts it on the list of known addresses and, if it belongs to the calling
    /// thread's frame, on that frame's list.
    void adopt(std::unique_ptr<Object> object);

    /// Ends the object's life: its content goes at once, its shell is kept for a while so that a later use is
    /// seen and not a crash.
    void retire(Object& object);

private:
    Standard_Mutex<> mutex_;
    std::unordered_map<Object*, std::unique_ptr<Object>> objects_ GUARDED_BY(mutex_);
    std::deque<std::unique_ptr<Object>> retired_ GUARDED_BY(mutex_);
};

} // namespace KPRV::broker
