#pragma once

#include <json/json.h>
#include <string>
#include <vector>

namespace KPRV::simulator {

/// One recorded call of an entry point.
struct Simulator_Call
{
    std::string name;
    Json::Value request;
};

/// A test's hand on the simulated adapter library: the functions of control.h, found at run time.
///
///     Simulator_Control simulator(path_of_libdzntj);
///     simulator.load_text(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:00:00:01"}}]})");
///     simulator.add_fault(R"({"call": "getHbaByWwn", "at": 2, "do": "throw"})");
///     ... use the module ...
///     EXPECT_EQ(simulator.requests("getHbaByWwn").size(), 3u);
///
/// Made before the module under test is opened, it decides which library the module gets: one that
/// asks for "libdzntj.so" by its bare name finds the one that is already there.
///
/// What is refused, or not found, is thrown as std::runtime_error with the reason.
class Simulator_Control
{
public:
    /// Opens the library by its path or bare name, or joins it if it is open. It stays open.
    explicit Simulator_Control(const std::string& library = "libdzntj.so");

    /// Puts an inventory in place of the present one, and its faults in place of the present ones.
    void load_text(const std::string& inventory);
    void load(const Json::Value& inventory);
    void load_file(const std::string& path);

    /// Forgets inventory, faults and calls: the next call reads what the environment names.
    void reset();

    void add_fault(const std::string& fault);
    void clear_faults();

    /// Lets every recorded call go that a "hold" fault holds.
    void release();

    /// Waits until the entry point has been called so often. False if that takes too long.
    bool wait_for_calls(const std::string& name, unsigned count, unsigned milliseconds = 120000);

    /// All recorded calls, or the names or the requests of some, oldest first.
    std::vector<Simulator_Call> calls();
    std::vector<std::string> call_names();
    std::vector<Json::Value> requests(const std::string& name);
    void clear_calls();
    /// How many of the latest calls are recorded from now on.
    void keep_calls(unsigned most);

    /// The object that simulator_status of control.h describes.
    Json::Value status();

    /// Sends a log line, or an event, to the registered callback. False if there is none.
    bool log(int level, const std::string& file, int line, const std::string& text);
    bool event(const std::string& text);
    /// Makes an event occur, which the library tells on a thread of its own.
    void queue_event(const std::string& text);

    /// An exported function, for example symbol<Json::Value(const Json::Value&)>("getHost").
    template <typename Function>
    Function* symbol(const std::string& name)
    {
        return reinterpret_cast<Function*>(address(name));
    }

private:
    void* address(const std::string& name);

    void* _library;
};

} // namespace KPRV::simulator
