#include "tests/bench/Floor_Row.h"

#include "tests/bench/Libraries.h"
#include "tests/bench/Ready_Objects.h"
#include "tests/bench/plain_support.h"

#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>

namespace KPRV::bench {

namespace {

/// What one answer of the module took, to be done again.
struct Recording
{
    Recorded_Calls calls;
    std::unique_ptr<Ready_Objects> objects;

    void replay(Lean_Broker& server) const
    {
        char host[256];
        plain_host_name(host, sizeof host);
        for (const auto& call : calls)
            call();
        objects->hand_over(server);
    }
};

std::vector<std::string> answer(const Floor_Row::Maker& maker)
{
    Lean_Broker& server = Lean_Broker::get();
    server.begin_call(true);
    maker(server)();
    return server.texts();
}

CMPIInstanceMI* provider_of(const char* class_name)
{
    static std::map<std::string, CMPIInstanceMI*> known;
    CMPIInstanceMI*& mi = known[class_name];
    if (!mi)
        mi = Module::get().instances(class_name);
    return mi;
}

} // namespace

void serve_instances()
{
    Lean_Broker::get().provider_of = provider_of;
}

Floor_Row::Maker floor_of(const Floor_Row& row)
{
    Floor_Row::Maker floor = row.floor;
    // What is made on first use is no part of a request.
    answer(row.ours);
    auto recording = std::make_shared<Recording>();
    Fast_Library::get().record(floor ? nullptr : &recording->calls);
    const std::vector<std::string> ours = answer(row.ours);
    Fast_Library::get().record(nullptr);
    if (!floor) {
        recording->objects = std::make_unique<Ready_Objects>(Lean_Broker::get());
        floor = [recording](Lean_Broker& server) { return [&] { recording->replay(server); }; };
    }
    if (ours.empty() || ours != answer(floor)) {
        fprintf(stderr, "bench: %s: the floor delivers something else than the module\n", row.name.c_str());
        exit(1);
    }
    return floor;
}

} // namespace KPRV::bench
