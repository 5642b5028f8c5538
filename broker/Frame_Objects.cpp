#include "broker/Frame_Objects.h"

namespace KPRV::broker {

namespace {

/// More than what a provider has in hand at a time.
constexpr std::size_t MOST_NOT_PACKED = 1024;

} // namespace

Frame_Objects::~Frame_Objects()
{
    for (Object* object = _first; object;) {
        Object* const next = object->after;
        _core->ledger.freed_by_frame(object->kind, object->maker);
        _core->retire(*object);
        object = next;
    }
}

void Frame_Objects::record(Object& object)
{
    object.frame = this;
    object.before = _last;
    (_last ? _last->after : _first) = &object;
    _last = &object;
    if (!_oldest)
        _oldest = &object;
    ++_not_packed;
}

void Frame_Objects::forget(Object& object)
{
    if (_oldest == &object)
        _oldest = object.after;
    if (!object.is_old)
        --_not_packed;
    (object.before ? object.before->after : _first) = object.after;
    (object.after ? object.after->before : _last) = object.before;
    object.frame = nullptr;
}

void Frame_Objects::pack_old()
{
    while (_not_packed > MOST_NOT_PACKED) {
        Object& object = *_oldest;
        _oldest = object.after;
        object.is_old = true;
        --_not_packed;
        _core->pack(object);
    }
}

} // namespace KPRV::broker
