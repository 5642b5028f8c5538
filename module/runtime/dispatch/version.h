#pragma once

/// The runtime's version is part of this name: a source built against another runtime does not link.
extern "C" const int __cimple_version_2_0_16;

namespace KPRV {

/// Keeps the reference to the version in every source that registers or dispatches providers.
[[gnu::used]] static const int* const __cimple_version_symbol = &__cimple_version_2_0_16;

} // namespace KPRV
