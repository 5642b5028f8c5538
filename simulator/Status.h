#pragma once

namespace KPRV::simulator {

/// The operational states that enabling and disabling a port leads to, as the library numbers them.
enum Status
{
    STOPPED = 10,
    IN_SERVICE = 11,
};

} // namespace KPRV::simulator
