#pragma once

namespace KPRV::bench {

// Measurements without a rival. Each prints lines "name <tab> value <tab> unit".

/// User time of a line below the level.
void print_log_figure(const char* name, bool tiny);
/// From the opening of the module to the end of the first enumeration, in processes of their own.
void print_load_figures(const char* program, bool tiny);
/// The child of the figure above: prints its nanoseconds.
void print_first_answer();
/// What memory has grown by over many calls of all kinds.
void print_growth_figures(bool tiny);
/// How long an event takes to the server, one by one and in a burst.
void print_event_figures(bool tiny);

} // namespace KPRV::bench
