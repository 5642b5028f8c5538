#pragma once

namespace KPRV {

/// The memory of the calling thread, as one library of the process sees it: its n-th allocation fails,
/// counted from 1, as do all that follow until `mend_memory`. Allocations of others, the server's and the
/// test's, go on as ever.
void watch_library(const char* path_part);
void fail_allocation(unsigned long nth);
/// How many allocations of the library were seen since `fail_allocation`.
unsigned long mend_memory();

} // namespace KPRV
