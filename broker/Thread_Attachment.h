#pragma once

#include "broker/Call.h"
#include "broker/Objects.h"

namespace KPRV::broker {

/// `CBPrepareAttachThread`: a copy of the context for another thread. Lives until that thread detaches.
Context_Object* prepare_attach(Core& core, const Context_Object& context);

/// `CBAttachThread` and `CBDetachThread`: open and close the calling thread's frame. Misuse is a violation: a
/// context that was not prepared or is in use, a thread that is in a call already, a thread that ends
/// attached.
CMPIrc attach_thread(Call_Base& call, std::shared_ptr<Core> core, Context_Object& context);
CMPIrc detach_thread(Call_Base& call, Core& core, Context_Object& context);

} // namespace KPRV::broker
