#include "broker/Call_Frame.h"

namespace KPRV::broker {

namespace {

thread_local Call_Frame* innermost = nullptr;

/// More than what a provider has in hand at a time.
constexpr std::size_t most_not_packed = 1024;

std::string described(const Object& object)
{
    return std::string(kind_name(object.kind)) + " made by " + object.maker;
}

} // namespace

Call_Frame::Call_Frame(std::shared_ptr<Core> core, const CMPIContext* context)
    : core_(std::move(core)), context_(context), outer_(innermost)
{
    innermost = this;
}

Call_Frame::~Call_Frame()
{
    for (Object* object = first_; object;) {
        Object* const next = object->after;
        core_->ledger.freed_by_frame(object->kind, object->maker);
        core_->retire(*object);
        object = next;
    }
    innermost = outer_;
}

Call_Frame* Call_Frame::top()
{
    return innermost;
}

bool Call_Frame::is_on_this_thread(const Call_Frame* frame)
{
    for (const Call_Frame* at = innermost; at; at = at->outer_)
        if (at == frame)
            return true;
    return false;
}

void Call_Frame::record(Object& object)
{
    object.frame = this;
    object.before = last_;
    (last_ ? last_->after : first_) = &object;
    last_ = &object;
    if (!oldest_)
        oldest_ = &object;
    ++not_packed_;
}

void Call_Frame::forget(Object& object)
{
    if (oldest_ == &object)
        oldest_ = object.after;
    if (!object.is_old)
        --not_packed_;
    (object.before ? object.before->after : first_) = object.after;
    (object.after ? object.after->before : last_) = object.before;
    object.frame = nullptr;
}

void Call_Frame::pack_old()
{
    while (not_packed_ > most_not_packed) {
        Object& object = *oldest_;
        oldest_ = object.after;
        object.is_old = true;
        --not_packed_;
        core_->pack(object);
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
    if (object.owner == Owner::HOST || object.owner == Owner::THREAD) {
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
