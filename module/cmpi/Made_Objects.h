#pragma once

#include <cmpimacs.h>

#include <vector>

namespace KPRV {

/// Gives an object back. A server that throws even there has it still, and the guard that calls this goes on.
template <class T>
void give_back(T* object) noexcept
{
    try {
        CMRelease(object);
    } catch (...) {
        return;
    }
}

/// Objects of the server that the module made for its own use, given back when they have been used. A request
/// needs none of this: the server frees what was made when the request ends. A thread of the module's own has
/// no such end while it lives.
class Made_Objects
{
public:
    Made_Objects() = default;
    ~Made_Objects()
    {
        for (const Made& each : _objects)
            each.release(each.object);
    }
    Made_Objects(const Made_Objects&) = delete;
    Made_Objects& operator=(const Made_Objects&) = delete;

    /// Takes note of the object; null is passed on.
    template <class T>
    T* note(T* object)
    {
        if (!object)
            return object;
        const Made made = {object, [](void* each) { give_back(static_cast<T*>(each)); }};
        try {
            _objects.push_back(made);
        } catch (...) {
            made.release(object);
            throw;
        }
        return object;
    }

private:
    struct Made
    {
        void* object;
        void (*release)(void* object);
    };
    std::vector<Made> _objects;
};

} // namespace KPRV
