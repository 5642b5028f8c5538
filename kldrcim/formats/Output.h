#pragma once

#include <string_view>

namespace KPRV::kldrcim {

/// What keeps standard output from being written: an errno. EPIPE is a reader that has had enough.
struct Output_Error
{
    int error;
};

/// To be called once, before anything is opened: an output that the caller has closed stays closed, and is
/// not taken by the first file that is opened. A reader that goes is seen by the write and does not end the
/// program.
void begin_output();

/// All that the program writes on standard output. Throws `Output_Error`.
void put(std::string_view text);

/// To be called behind each result: the first goes out to the reader at once, the others before a moment has
/// passed, where there are so many of them. Who makes one a second is seen at work.
void flush_in_time();

/// Out to the reader, now: before something that takes long, and at the end.
void flush_output();

} // namespace KPRV::kldrcim
