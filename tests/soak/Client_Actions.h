#pragma once

#include "broker/Local_Server.h"
#include "simulator/Simulator_Control.h"

#include <atomic>
#include <random>
#include <span>

namespace KPRV {

/// What the clients of a soak share: the server, the adapter library, and what they have found so far.
struct Soak_World
{
    broker::Local_Server& server;
    simulator::Simulator_Control& simulator;
    std::vector<std::string> classes = {};
    std::vector<std::string> associations = {};
    /// Classes of jobs and records. To read a hundred records takes as many enumerations of ports, and to
    /// walk along them a hundred times that, so this is done apart and seldom.
    std::vector<std::string> memories = {};
    /// Paths of the device model, from which clients walk on.
    std::vector<broker::Path_Value> paths = {};
    /// Paths of the elements and of the tests that can be run on them.
    std::vector<broker::Path_Value> elements = {};
    std::vector<broker::Path_Value> tests = {};
    std::mutex subscription = {};
    unsigned subscribers = 0;
    std::atomic<unsigned long> indications = 0;
    std::atomic<unsigned long> test_runs = 0;
    std::atomic<unsigned long> failures = 0;
};

using Random = std::minstd_rand;

/// One thing that a client does, and how often it does so beside the others.
struct Client_Action
{
    const char* name;
    unsigned weight;
    void (*run)(Soak_World& world, Random& random);
};

/// All of them; the weights add up to 1000.
std::span<const Client_Action> client_actions();

/// One action, by weight.
const Client_Action& choose_action(Random& random);

/// True for jobs and records, which tests leave behind.
bool remembers_tests(const std::string& class_name);

/// Fills in what the clients start from.
void look_around(Soak_World& world);

/// Takes back what subscriptions are left.
void end_subscriptions(Soak_World& world);

} // namespace KPRV
