#pragma once

namespace KPRV {

/// Keeps the library that holds this code mapped until the process ends. Nothing joins a test thread, so a
/// server that unloads the module while a test runs would take the code from under it.
void pin_module();

} // namespace KPRV
