#pragma once

namespace KPRV {

/// The memory of the calling thread, as one library of the process sees it: its n-th allocation fails,
/// counted from 1, as do all that follow until `mend_memory`, or that one alone. Allocations of others, the
/// server's and the test's, go on as ever. With helpers, what the C++ and the JSON library allocate because
/// the library called them is the library's, too.
void watch_library(const char* path_part, bool helpers_too = false);
void fail_allocation(unsigned long nth, bool once = false);
/// The same for each thread that begins from now on; 0 for none. How many allocations the busiest of those
/// before has made.
unsigned long fail_allocation_of_new_threads(unsigned long nth, bool once = false);
/// How many allocations of the library were seen since `fail_allocation`.
unsigned long mend_memory();

} // namespace KPRV
