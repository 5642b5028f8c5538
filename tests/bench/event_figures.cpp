#include "tests/bench/Figures.h"
#include "tests/bench/Lean_Broker.h"
#include "tests/bench/Libraries.h"
#include "tests/bench/Stop_Watch.h"

#include <algorithm>
#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <unistd.h>

namespace KPRV::bench {

namespace {

/// The delivery thread sleeps this long in every pass.
constexpr double PAUSE = 20e6;
constexpr size_t MOST = 1000;

const Stop_Watch watch;
std::atomic<size_t> arrived;
double arrivals[MOST];

void on_indication()
{
    const size_t number = arrived.load(std::memory_order_relaxed);
    if (number < MOST)
        arrivals[number] = watch.passed();
    arrived.store(number + 1, std::memory_order_release);
}

void send()
{
    // A category of which each event is one indication.
    Fast_Library::get().send_event(
        R"({"eventCategory": 4, "eventId": 1, "eventSeverity": 2, "eventMsg": "Remote port online",
            "eventIdValue": "ZNT_RPORT_ONLINE", "basePortWWN": "20:00:8c:7c:00:00:00:00"})");
}

void wait_for(size_t count)
{
    const Stop_Watch patience;
    while (arrived.load(std::memory_order_acquire) < count) {
        usleep(500);
        if (patience.passed() > 60e9) {
            fputs("bench: an event got lost\n", stderr);
            exit(1);
        }
    }
}

/// One after the other, at any moment of the pause.
void print_single(int events)
{
    std::vector<double> delays;
    double worst = 0, sum = 0;
    for (int i = 0; i < events; i++) {
        usleep(1000 * (i * 7 % 20));
        const size_t before = arrived;
        const double sent = watch.passed();
        send();
        wait_for(before + 1);
        delays.push_back((arrivals[before] - sent) / 1e6);
        worst = std::max(worst, delays.back());
        sum += delays.back();
    }
    printf("B6 event to server, mean\t%.2f\tms\n", sum / events);
    printf("B6 event to server, worst\t%.2f\tms\n", worst);
    printf("B6 added to the pause at worst\t%.2f\tms\n", std::max(0.0, worst - PAUSE / 1e6));
}

/// Many at once leave one after the other, each after a pause.
void print_burst(int events)
{
    const size_t before = arrived;
    for (int i = 0; i < events; i++)
        send();
    wait_for(before + events);
    const double passed = arrivals[before + events - 1] - arrivals[before];
    printf("B6 burst of %d, rate\t%.2f\tevents/s\n", events, (events - 1) / (passed / 1e9));
    printf("B6 burst, added to each pause\t%.3f\tms\n", (passed / (events - 1) - PAUSE) / 1e6);
    double least = passed;
    for (int i = 1; i < events; i++)
        least = std::min(least, arrivals[before + i] - arrivals[before + i - 1]);
    printf("B6 burst, least time between two\t%.3f\tms\n", least / 1e6);
}

} // namespace

void print_event_figures(bool tiny)
{
    Lean_Broker& server = Lean_Broker::get();
    server.begin_call();
    CMPIIndicationMI* const mi = Module::get().indications("KALDERA_AlertIndication");
    server.on_indication = on_indication;
    mi->ft->activateFilter(mi, server.context(), nullptr, "KALDERA_AlertIndication",
                           server.path("KALDERA_AlertIndication"), 1);
    mi->ft->enableIndications(mi, server.context());
    print_single(tiny ? 3 : 100);
    print_burst(tiny ? 3 : 250);
    mi->ft->disableIndications(mi, server.context());
}

} // namespace KPRV::bench
