#pragma once

namespace KPRV {

/// Runs a program of the search path with the arguments, the first of which is its name, and waits for it.
/// The result is the program's wait status, in the form that a shell's caller knows: 127 << 8 for a program
/// that is not there, 126 << 8 for one that cannot be run; or -1 where no process can be made.
///
/// The program finds none of what its caller, a server, has set up for itself: signals stand as at the start
/// of a process, standard input is empty, and of the open descriptors there are standard output and error
/// alone. Whether the server ignores the end of its children, or waits for all of them, does not matter:
/// nothing of its own settings is used or touched.
int run_program(const char* const* arguments);

} // namespace KPRV
