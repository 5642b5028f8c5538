#pragma once

#include "module/runtime/system/Standard_Mutex.h"

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
    void put_line() REQUIRES(_mutex);

    Standard_Mutex<> _mutex;
    std::condition_variable_any _change;
    std::string _class_name GUARDED_BY(_mutex);
    std::size_t _count GUARDED_BY(_mutex) = 0;
    bool _is_over GUARDED_BY(_mutex) = false;
    std::thread _thread;
};

} // namespace KPRV::kldrcim
