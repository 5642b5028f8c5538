#pragma once

namespace KPRV {

/// Fills the dispatcher with the methods of all families.
class MethodRegistration
{
public:
    static void registerMethods();
};

} // namespace KPRV
