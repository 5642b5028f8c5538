#pragma once

#include "module/runtime/Standard_Mutex.h"

#include <condition_variable>
#include <string>
#include <thread>

namespace KPRV::kldrcim {

/// Shows on standard error what a walk is at, once it lasts longer than a second; the line is gone at the
/// end. Does nothing where standard error is no terminal.
class Walk_Progress
{
public:
    Walk_Progress();
    /// The line is gone.
    ~Walk_Progress() { end(); }
    Walk_Progress(const Walk_Progress&) = delete;
    Walk_Progress& operator=(const Walk_Progress&) = delete;

    /// From the thread that walks.
    void at(const std::string& class_name, std::size_t count);
    /// Before anything else is written; nothing is shown behind it.
    void end();

private:
    void show();
    void put_line() REQUIRES(mutex_);

    Standard_Mutex<> mutex_;
    std::condition_variable_any change_;
    std::string class_name_ GUARDED_BY(mutex_);
    std::size_t count_ GUARDED_BY(mutex_) = 0;
    bool is_over_ GUARDED_BY(mutex_) = false;
    std::thread thread_;
};

} // namespace KPRV::kldrcim
