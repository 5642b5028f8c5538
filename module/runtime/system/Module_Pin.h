#pragma once

namespace KPRV {

/// Keeps the library that holds this code mapped, although its server closes it: a thread that the library
/// has started would find no code any more. A program that has the code in itself needs nothing, and has
/// nothing held.
class Module_Pin
{
public:
    /// Until the process ends: for threads that nobody joins.
    static void hold_for_ever();

    Module_Pin() = default;
    Module_Pin(const Module_Pin&) = delete;
    Module_Pin& operator=(const Module_Pin&) = delete;

    /// Until `give_back`.
    void hold();
    /// For a caller that is in the library by its server's call, since the library may go with the pin.
    void give_back();

private:
    void* _library = nullptr;
};

} // namespace KPRV
