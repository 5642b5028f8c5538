#include "broker/Thread_Attachment.h"

#include <optional>

namespace KPRV::broker {

namespace {

/// The attachment of a thread. Its end with the thread shows who forgot to detach.
struct Attachment
{
    std::optional<Call_Frame> frame;
    Context_Object* context = nullptr;

    ~Attachment()
    {
        if (frame)
            frame->core().violations.add("CBDetachThread", "a thread ended while it was attached");
    }
};

thread_local Attachment attachment;

} // namespace

Context_Object* prepare_attach(Core& core, const Context_Object& context)
{
    auto* prepared = detail::make<Context_Object>(core, "CBPrepareAttachThread", Owner::THREAD, context);
    prepared->prepared = true;
    return prepared;
}

CMPIrc attach_thread(Call_Base& call, std::shared_ptr<Core> core, Context_Object& context)
{
    if (Call_Frame::top())
        call.violation(*core, CMPI_RC_ERR_FAILED, "this thread is in a call or attached already");
    else if (!context.prepared)
        call.violation(*core, CMPI_RC_ERR_INVALID_PARAMETER, "the context is not from CBPrepareAttachThread");
    else if (context.attached.exchange(true))
        call.violation(*core, CMPI_RC_ERR_INVALID_PARAMETER, "another thread is attached with this context");
    else {
        attachment.frame.emplace(std::move(core), context.cmpi());
        attachment.context = &context;
    }
    return call.code();
}

CMPIrc detach_thread(Call_Base& call, Core& core, Context_Object& context)
{
    if (!attachment.frame || attachment.context != &context) {
        call.violation(core, CMPI_RC_ERR_INVALID_PARAMETER, "this thread is not attached with this context");
        return call.code();
    }
    attachment.frame.reset();
    attachment.context = nullptr;
    core.ledger.freed_by_frame(context.kind, context.maker);
    core.retire(context);
    return CMPI_RC_OK;
}

} // namespace KPRV::broker
