#pragma once

#include "module/runtime/objects/Instance.h"

#include <utility>

namespace KPRV {

/// Counted pointer to an instance. Construction takes over the caller's count; copies raise it.
template <class T>
class Ref
{
public:
    Ref() = default;
    explicit Ref(T* ptr) : _ptr(ptr) {}
    Ref(const Ref& x) : _ptr(x._ptr) { ref(_ptr); }
    Ref(Ref&& x) noexcept : _ptr(std::exchange(x._ptr, nullptr)) {}
    ~Ref()
    {
        if (_ptr)
            unref(_ptr);
    }

    Ref& operator=(const Ref& x)
    {
        if (_ptr != x._ptr) {
            unref(_ptr);
            _ptr = x._ptr;
            ref(_ptr);
        }
        return *this;
    }
    Ref& operator=(Ref&& x) noexcept
    {
        std::swap(_ptr, x._ptr);
        return *this;
    }
    /// Releases what is held and takes over the pointer.
    void reset(T* ptr = nullptr)
    {
        unref(_ptr);
        _ptr = ptr;
    }

    T* ptr() const { return _ptr; }
    T* operator->() const { return _ptr; }
    T& operator*() const { return *_ptr; }
    explicit operator bool() const { return _ptr != nullptr; }
    /// Gives the pointer and its count away.
    T* steal() { return std::exchange(_ptr, nullptr); }

private:
    T* _ptr = nullptr;
};

} // namespace KPRV
