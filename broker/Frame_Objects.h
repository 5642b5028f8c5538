#pragma once

#include "broker/Core.h"

namespace KPRV::broker {

/// The objects that one call has made and nobody has released yet, in the order in which they were made. With
/// it they end.
class Frame_Objects
{
public:
    explicit Frame_Objects(std::shared_ptr<Core> core) : _core(std::move(core)) {}
    ~Frame_Objects();
    Frame_Objects(const Frame_Objects&) = delete;
    Frame_Objects& operator=(const Frame_Objects&) = delete;

    Core& core() const { return *_core; }

    void record(Object& object);
    void forget(Object& object);
    /// Packs all but those made last.
    void pack_old();

private:
    const std::shared_ptr<Core> _core;
    Object* _first = nullptr;
    Object* _last = nullptr;
    /// The first that may still be packed.
    Object* _oldest = nullptr;
    std::size_t _not_packed = 0;
};

} // namespace KPRV::broker
