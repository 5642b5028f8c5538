#pragma once

#include "broker/Frame_Objects.h"

namespace KPRV::broker {

/// What a thread owes to one MI entry (or to one attachment): the objects made meanwhile, which end with it.
/// Frames of a thread stack up when an up-call comes back into the module. Used by its own thread only.
///
/// How it works. A server calls an entry of a provider, and whatever the provider makes through the broker
/// until it returns is the server's to free then. The frame stands on the stack of the call: its constructor
/// makes it the thread's innermost, `make_object` records each object on that one, and its destructor retires
/// what is still recorded and puts the outer frame back. A clone is recorded nowhere: it is the provider's to
/// release. `CMRelease` takes an object off its frame, if the frame is on the caller's thread. Retired is not
/// freed: the object stays with a mark, so that a use after the call is a line in `Violations`. A thread that
/// is attached has a frame from attachment to detachment.
///
/// A provider may use what it made until its call ends, and most never do: an enumeration leaves a dozen
/// objects of each instance behind. With each delivery those that many others have followed are packed, until
/// somebody asks for them.
class Call_Frame
{
public:
    Call_Frame(std::shared_ptr<Core> core, const CMPIContext* context);
    ~Call_Frame();
    Call_Frame(const Call_Frame&) = delete;
    Call_Frame& operator=(const Call_Frame&) = delete;

    /// The innermost frame of the calling thread, null if it has none.
    static Call_Frame* top();
    /// True if these are the objects of one of the calling thread's frames.
    static bool is_on_this_thread(const Frame_Objects* objects);

    Core& core() const { return _objects->core(); }
    const CMPIContext* context() const { return _context; }

    void record(Object& object) { _objects->record(object); }
    /// Packs all but those made last. No object of this frame may be in hand meanwhile.
    void pack_old() { _objects->pack_old(); }

private:
    std::unique_ptr<Frame_Objects> _objects;
    const CMPIContext* _context;
    Call_Frame* _outer;
};

/// While it stands, what the thread's calls leave behind is freed later than with their end: with the end of
/// the next call, or of this. For a server whose client need not wait for it.
class Late_Freeing
{
public:
    Late_Freeing();
    ~Late_Freeing();
    Late_Freeing(const Late_Freeing&) = delete;
    Late_Freeing& operator=(const Late_Freeing&) = delete;

private:
    friend Call_Frame;
    std::unique_ptr<Frame_Objects> _left;
};

/// Makes an object for the provider under the name of the call that makes it, and records it on the thread's
/// frame. A thread without a frame has nobody to free it: that is a violation, and the object is lost.
template <class T, class... Arguments>
T* make_object(Core& core, const char* maker, Arguments&&... arguments);

/// Makes a clone: not recorded; the provider must release it.
template <class T, class... Arguments>
T* make_clone(Core& core, Arguments&&... arguments);

/// Makes an argument of a call: the server's own, ended by the server.
template <class T, class... Arguments>
T* make_argument(Core& core, Arguments&&... arguments);

/// `CMRelease`, once the object is known to be good: the rules on who may release what.
CMPIrc release_by_provider(Object& object);

namespace detail {

void settle_on_frame(Object& object);

/// Room for an object that is being made.
class Fresh_Place
{
public:
    Fresh_Place(Core& core, std::size_t size) : _core(core), _place(core.blocks.take_for_object(size)) {}
    ~Fresh_Place()
    {
        if (_object)
            _object->~Object();
        if (_place)
            _core.blocks.give_object(_place);
    }
    Fresh_Place(const Fresh_Place&) = delete;
    Fresh_Place& operator=(const Fresh_Place&) = delete;

    template <class T, class... Arguments>
    T* make(Arguments&&... arguments)
    {
        T* const made = new (_place) T(_core, std::forward<Arguments>(arguments)...);
        _object = made;
        return made;
    }
    /// From here on both are the core's.
    void keep()
    {
        _object = nullptr;
        _place = nullptr;
    }

private:
    Core& _core;
    void* _place;
    Object* _object = nullptr;
};

template <class T, class... Arguments>
T* make(Core& core, const char* maker, Owner owner, Arguments&&... arguments)
{
    Fresh_Place place(core, sizeof(T));
    T* const made = place.template make<T>(std::forward<Arguments>(arguments)...);
    made->maker = maker;
    made->owner = owner;
    core.adopt(*made);
    place.keep();
    if (owner == Owner::FRAME)
        settle_on_frame(*made);
    return made;
}

} // namespace detail

template <class T, class... Arguments>
T* make_object(Core& core, const char* maker, Arguments&&... arguments)
{
    return detail::make<T>(core, maker, Owner::FRAME, std::forward<Arguments>(arguments)...);
}

template <class T, class... Arguments>
T* make_clone(Core& core, Arguments&&... arguments)
{
    return detail::make<T>(core, "CMClone", Owner::PROVIDER, std::forward<Arguments>(arguments)...);
}

template <class T, class... Arguments>
T* make_argument(Core& core, Arguments&&... arguments)
{
    return detail::make<T>(core, "the call", Owner::SERVER, std::forward<Arguments>(arguments)...);
}

/// Keeps an argument alive for the length of a call.
template <class T>
class Argument
{
public:
    template <class... Arguments>
    explicit Argument(Core& core, Arguments&&... arguments)
        : _object(make_argument<T>(core, std::forward<Arguments>(arguments)...))
    {
    }
    ~Argument() { _object->core.retire(*_object); }
    Argument(const Argument&) = delete;
    Argument& operator=(const Argument&) = delete;

    T* operator->() const { return _object; }
    T& operator*() const { return *_object; }
    typename T::Cmpi* cmpi() const { return _object->cmpi(); }

private:
    T* _object;
};

} // namespace KPRV::broker
