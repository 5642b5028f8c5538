#include "broker/Call_Frame.h"

namespace KPRV::broker {

namespace {

thread_local Call_Frame* innermost = nullptr;

/// More than what a provider has in hand at a time.
constexpr std::size_t MOST_NOT_PACKED = 1024;

std::string described(const Object& object)
{
    return std::string(kind_name(object.kind)) + " made by " + object.maker;
}

} // namespace

Call_Frame::Call_Frame(std::shared_ptr<Core> core, const CMPIContext* context)
    : _core(std::move(core)), _context(context), _outer(innermost)
{
    innermost = this;
}

Call_Frame::~Call_Frame()
{
    for (Object* object = _first; object;) {
        Object* const next = object->after;
        _core->ledger.freed_by_frame(object->kind, object->maker);
        _core->retire(*object);
        object = next;
    }
    innermost = _outer;
}

Call_Frame* Call_Frame::top()
{
    return innermost;
}

bool Call_Frame::is_on_this_thread(const Call_Frame* frame)
{
    for (const Call_Frame* at = innermost; at; at = at->_outer)
        if (at == frame)
            return true;
    return false;
}

void Call_Frame::record(Object& object)
{
    object.frame = this;
    object.before = _last;
    (_last ? _last->after : _first) = &object;
    _last = &object;
    if (!_oldest)
        _oldest = &object;
    ++_not_packed;
}

void Call_Frame::forget(Object& object)
{
    if (_oldest == &object)
        _oldest = object.after;
    if (!object.is_old)
        --_not_packed;
    (object.before ? object.before->after : _first) = object.after;
    (object.after ? object.after->before : _last) = object.before;
    object.frame = nullptr;
}

void Call_Frame::pack_old()
{
    while (_not_packed > MOST_NOT_PACKED) {
        Object& object = *_oldest;
        _oldest = object.after;
        object.is_old = true;
        --_not_packed;
        _core->pack(object);
    }
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
