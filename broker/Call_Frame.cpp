#include "broker/Call_Frame.h"

namespace KPRV::broker {

namespace {

thread_local Call_Frame* innermost = nullptr;
thread_local Late_Freeing* late = nullptr;

std::string described(const Object& object)
{
    return std::string(kind_name(object.kind)) + " made by " + object.maker;
}

} // namespace

Call_Frame::Call_Frame(std::shared_ptr<Core> core, const CMPIContext* context)
    : _objects(std::make_unique<Frame_Objects>(std::move(core))), _context(context), _outer(innermost)
{
    innermost = this;
}

Call_Frame::~Call_Frame()
{
    // Calls that come back into the module while another one runs are many.
    if (late && !_outer)
        late->_left = std::move(_objects);
    else
        _objects.reset();
    innermost = _outer;
}

Call_Frame* Call_Frame::top()
{
    return innermost;
}

bool Call_Frame::is_on_this_thread(const Frame_Objects* objects)
{
    for (const Call_Frame* at = innermost; at; at = at->_outer)
        if (at->_objects.get() == objects)
            return true;
    return false;
}

Late_Freeing::Late_Freeing()
{
    late = this;
}

Late_Freeing::~Late_Freeing()
{
    late = nullptr;
}

void detail::settle_on_frame(Object& object)
{
    Call_Frame* frame = Call_Frame::top();
    if (frame && &frame->core() == &object.core)
        frame->record(object);
    else
        object.core.violations.add(object.maker, std::string("makes a ") + kind_name(object.kind) +
                                                     " on a thread that is neither in a call nor attached");
}

CMPIrc release_by_provider(Object& object)
{
    Core& core = object.core;
    if (object.owner == Owner::SERVER || object.owner == Owner::THREAD) {
        core.violations.add("CMRelease", "the provider does not own this " + described(object));
        return CMPI_RC_ERR_FAILED;
    }
    if (object.frame && !Call_Frame::is_on_this_thread(object.frame)) {
        core.violations.add("CMRelease", "released on another thread than its own: " + described(object));
        return CMPI_RC_ERR_FAILED;
    }
    if (object.frame)
        object.frame->forget(object);
    core.ledger.released(object.kind, object.maker);
    core.retire(object);
    return CMPI_RC_OK;
}

} // namespace KPRV::broker
