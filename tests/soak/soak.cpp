// Eight clients at once for as long as is asked, over adapters that come and go: what the process takes must
// not grow, and at the end the module must answer as a fresh one does.
//
// soak MINUTES FOLDER writes soak.json and soak.svg into FOLDER; soak --picture prints what a fresh process
// answers.
#include "tests/soak/Client_Actions.h"
#include "tests/soak/Process_Figures.h"
#include "tests/support/Module_Picture.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <malloc.h>
#include <map>
#include <thread>

namespace KPRV {
namespace {

using Clock = std::chrono::steady_clock;

constexpr unsigned CLIENTS = 8;

/// Each delivered alert, and the input of each test run, stays allocated on purpose.
constexpr double ALERT_KIB = 2.0;
constexpr double TEST_INPUT_KIB = 0.5;
/// Records and queues are fuller at one moment than at another.
constexpr double HEAP_SLACK_KIB = 1024;
/// What the allocator cannot give back between blocks that are still held.
constexpr double RESIDENT_SLACK_KIB = 8192;

std::string picture_text(broker::Local_Server& server)
{
    std::string text;
    for (const std::string& name : enumerable_classes(server)) {
        // A fresh process has run no tests.
        if (remembers_tests(name))
            continue;
        text += name + "\n";
        for (const std::string& instance : lasting_texts(server.enumerate_instances(name)))
            text += instance;
    }
    return text;
}

std::unique_ptr<broker::Local_Server> open_module()
{
    std::string error;
    broker::Server_Options options;
    // Remembered at once, whatever the speed: until they are all there they would be taken for growth.
    options.most_shells = 4096;
    auto server = broker::Local_Server::open(KLDR_MODULE, options, error);
    if (!server)
        std::fprintf(stderr, "soak: %s\n", error.c_str());
    return server;
}

/// What another process answers, over the same inventory.
std::string fresh_picture(const char* program)
{
    std::string text;
    const std::string command = std::string(program) + " --picture";
    std::FILE* pipe = popen(command.c_str(), "r");
    char part[4096];
    for (std::size_t n; pipe && (n = fread(part, 1, sizeof part, pipe)) > 0;)
        text.append(part, n);
    if (pipe)
        pclose(pipe);
    return text;
}

class Soak
{
public:
    Soak(broker::Local_Server& server, simulator::Simulator_Control& simulator, double seconds)
        : _world{.server = server, .simulator = simulator}, _start(Clock::now()),
          _end(_start + std::chrono::milliseconds(static_cast<long>(seconds * 1000)))
    {
        look_around(_world);
        // The record of calls is for tests that look at it. Where this thread waits long for its turn it
        // would be taken for growth.
        simulator.keep_calls(1);
        server.set_sink([this](const std::string&, const broker::Instance_Value&) {
            ++_world.indications;
            return CMPI_RC_OK;
        });
    }

    void run()
    {
        std::vector<std::thread> clients;
        for (unsigned i = 0; i < CLIENTS; ++i)
            clients.emplace_back([this, i] { be_client(i); });
        while (Clock::now() < _end) {
            std::this_thread::sleep_for(std::chrono::milliseconds(250));
            sample();
        }
        for (std::thread& client : clients)
            client.join();
        end_subscriptions(_world);
        _world.simulator.clear_faults();
    }

    const Soak_World& world() const { return _world; }
    const std::vector<Process_Figures>& samples() const { return _samples; }
    const std::map<std::string, unsigned long>& counts() const { return _counts; }

    /// Lines that say what is wrong; none if all is well.
    std::vector<std::string> complaints()
    {
        std::vector<std::string> lines;
        [[maybe_unused]] const double on_purpose = ALERT_KIB * static_cast<double>(_world.indications) +
                                                   TEST_INPUT_KIB * static_cast<double>(_world.test_runs);
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
        // Sanitizers keep what is freed, and shadow what is used.
        check(lines, "heap KiB rose by", rise(_samples, &Process_Figures::heap_kib),
              HEAP_SLACK_KIB + on_purpose);
        check(lines, "resident KiB rose by", rise(_samples, &Process_Figures::resident_kib),
              RESIDENT_SLACK_KIB + on_purpose);
#endif
        check(lines, "descriptors rose by", rise(_samples, &Process_Figures::descriptors), 2);
        // A test thread and the delivery thread come and go.
        check(lines, "threads rose by", rise(_samples, &Process_Figures::threads), 4);
        check(lines, "live CMPI objects at the end:", static_cast<double>(_world.server.ledger().live()), 0);
        check(lines, "failures:", static_cast<double>(_world.failures), 0);
        for (const std::string& violation : _world.server.violations().list())
            lines.push_back(violation);
        return lines;
    }

private:
    static void check(std::vector<std::string>& lines, const char* what, double value, double most)
    {
        char text[160];
        std::snprintf(text, sizeof text, "%s %.0f, at most %.0f", what, value, most);
        if (value > most)
            lines.push_back(text);
    }

    void be_client(unsigned number)
    {
        Random random(number + 1);
        std::map<std::string, unsigned long> counts;
        while (Clock::now() < _end) {
            const Client_Action& action = choose_action(random);
            action.run(_world, random);
            ++counts[action.name];
        }
        const std::lock_guard lock(_mutex);
        for (const auto& [name, count] : counts)
            _counts[name] += count;
    }

    void sample()
    {
        Process_Figures figures = process_figures();
        figures.seconds = std::chrono::duration<double>(Clock::now() - _start).count();
        figures.live_objects = static_cast<double>(_world.server.ledger().live());
        _samples.push_back(figures);
    }

    Soak_World _world;
    const Clock::time_point _start;
    const Clock::time_point _end;
    std::mutex _mutex;
    std::map<std::string, unsigned long> _counts;
    std::vector<Process_Figures> _samples;
};

void write_results(const std::string& folder, const Soak& soak)
{
    std::ofstream(folder + "/soak.svg") << figures_svg(soak.samples());
    std::ofstream json(folder + "/soak.json");
    json << "{\n  \"counts\": {";
    const char* comma = "";
    for (const auto& [name, count] : soak.counts()) {
        json << comma << "\"" << name << "\": " << count;
        comma = ", ";
    }
    json << "},\n  \"indications\": " << soak.world().indications
         << ",\n  \"testRuns\": " << soak.world().test_runs;
    for (const Figure_Series& series : figure_series)
        json << ",\n  \"" << series.name << " rose by\": " << rise(soak.samples(), series.member);
    json << "\n}\n";
}

int soak_for(const char* program, double minutes, const std::string& folder)
{
    simulator::Simulator_Control simulator(KLDR_SIMULATOR);
    auto server = open_module();
    if (!server)
        return 2;
    Soak soak(*server, simulator, minutes * 60);
    soak.run();
    // A test that still runs keeps its thread attached until it ends.
    for (int i = 0; i < 300 && server->ledger().live(); i++)
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
    write_results(folder, soak);
    std::vector<std::string> complaints = soak.complaints();

    // What the clients set is forgotten with the inventory that held it.
    simulator.reset();
    if (picture_text(*server) != fresh_picture(program))
        complaints.push_back("the answers differ from those of a fresh process");
    for (const auto& [name, count] : soak.counts())
        std::printf("%-16s %10lu\n", name.c_str(), count);
    std::printf("%-16s %10lu\n%-16s %10lu\n", "indications", soak.world().indications.load(), "test runs",
                soak.world().test_runs.load());
    for (const Figure_Series& series : figure_series)
        std::printf("%s: %+.0f\n", series.name, rise(soak.samples(), series.member));
    for (const std::string& complaint : complaints)
        std::fprintf(stderr, "soak: %s\n", complaint.c_str());
    return complaints.empty() ? 0 : 1;
}

int print_picture()
{
    simulator::Simulator_Control simulator(KLDR_SIMULATOR);
    auto server = open_module();
    return server && std::fputs(picture_text(*server).c_str(), stdout) >= 0 ? 0 : 2;
}

} // namespace
} // namespace KPRV

int main(int argc, char** argv)
{
    setenv("KLDR_SIMULATOR_INVENTORY", KLDR_INVENTORIES "/demo.json", 1);
    // One arena, so that its figures are those of the whole heap.
    mallopt(M_ARENA_MAX, 1);
    // Without an rc file nothing is logged: an hour of traces is not what is measured.
    setenv("HOME", "/nonexistent", 1);
    if (argc == 2 && std::strcmp(argv[1], "--picture") == 0)
        return KPRV::print_picture();
    if (argc != 3) {
        std::fprintf(stderr, "usage: %s MINUTES FOLDER\n", argv[0]);
        return 2;
    }
    return KPRV::soak_for(argv[0], std::atof(argv[1]), argv[2]);
}
