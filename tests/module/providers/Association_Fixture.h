#pragma once

#include "tests/module/providers/Instance_Script.h"
#include "tests/module/providers/Scripted_Managers.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Live_Blocks.h"
#include "tests/support/Log_Capture.h"

#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/dispatch/Operation.h"
#include "module/runtime/objects/Meta_Property.h"
#include "module/runtime/objects/Ref.h"

#include <gtest/gtest.h>

namespace KPRV {

/// What one enumeration of an association came to.
struct Enumeration
{
    /// Each association instance as the labels of its ends, in the order of the roles asked for.
    Lines pairs;
    /// The fetches, in order.
    Lines fetched;
    /// What the provider's own file logged, line ends left off, between its first and its last line, which
    /// are its traces.
    Lines said;
    int status = -1;
    /// Statuses of the end marks.
    std::vector<int> end_marks;
};

inline constexpr const char* BUILDING = "DBG Building and returning association instances";

/// Lists by script, an association by name:
///
///     lists("ComputerSystem: s; FCPort: p1, p2");
///     expect("FCPortSystemDevice", "GroupComponent PartComponent", "s p1, s p2");
class Association_Fixture : public ::testing::Test
{
protected:
    Association_Fixture() { managers_script.clear(); }
    ~Association_Fixture() override { managers_script.clear(); }

    /// "<list>: <label Property=text ...>, ...; <list>: ...", in place of what was there.
    void lists(const std::string& text)
    {
        managers_script.clear();
        for (const std::string& list : pieces(text, ';')) {
            const size_t colon = list.find(':');
            const std::string name = list.substr(0, colon);
            for (const std::string& element : pieces(list.substr(colon + 1), ','))
                managers_script.lists[name].push_back(scripted_instance(class_of_list(name), element));
        }
    }

    static const Registration* registration(const std::string& association)
    {
        const std::string name = "KALDERA_" + association + "_Provider";
        for (const Registration* each = _cimple_registration_head; each; each = each->next) {
            if (each->provider_name == name)
                return each;
        }
        throw std::invalid_argument("no provider " + name);
    }

    /// Enumerates twice: the second time, with all that is made once already made, must leave nothing behind.
    Enumeration enumerate(const std::string& association, const std::string& roles)
    {
        const Registration* provider = registration(association);
        Enumeration result;
        log.clear();
        forget_calls();
        Receiver receiver{pieces(roles, ' '), &result};
        result.status = call(provider, receiver);
        result.fetched = managers_script.fetched;
        result.said = said_by(std::string(provider->provider_name) + ".cpp");
        library_calls = library.calls;

        forget_calls();
        const size_t before = live_blocks();
        call_for_nobody(provider);
        EXPECT_EQ(before, live_blocks()) << association << " leaves something behind";
        EXPECT_EQ("", lost_without_a_block([&] { call_for_nobody(provider); }, [&] { forget_calls(); }))
            << association;
        return result;
    }

    /// Success with these pairs, "a b, a c", after the line about building.
    void expect(const std::string& association, const std::string& roles, const std::string& pairs,
                const Lines& said = {BUILDING})
    {
        SCOPED_TRACE(association);
        const Enumeration result = enumerate(association, roles);
        EXPECT_EQ(pieces(pairs, ','), result.pairs);
        EXPECT_EQ(0, result.status);
        EXPECT_EQ(std::vector<int>{0}, result.end_marks);
        EXPECT_EQ(said, result.said);
    }

    Fake_Library library;
    Log_Capture log;
    /// Of the last enumeration.
    std::vector<Fake_Library::Call> library_calls;

private:
    void forget_calls()
    {
        std::vector<Fake_Library::Call>().swap(library.calls);
        std::vector<std::string>().swap(managers_script.fetched);
    }

    void call_for_nobody(const Registration* provider)
    {
        Receiver nobody{{}, nullptr};
        call(provider, nobody);
        forget_calls();
    }

    struct Receiver
    {
        std::vector<std::string> roles;
        Enumeration* result;
    };

    static const Meta_Class* class_of_list(const std::string& name)
    {
        if (name.starts_with("FC ports"))
            return class_named("FCPort");
        if (name.starts_with("Ethernet ports"))
            return class_named("EthernetPort");
        return class_named(name.find("tests") == std::string::npos ? name : "LoopbackDiagnosticTest");
    }

    static int call(const Registration* provider, Receiver& receiver)
    {
        void* object = nullptr;
        provider->proc(provider, OP_CREATE_PROVIDER, &object, nullptr, nullptr, nullptr, nullptr, nullptr,
                       nullptr, nullptr);
        const auto destroy_provider = [=](void* made) {
            provider->proc(provider, OP_DESTROY_PROVIDER, made, nullptr, nullptr, nullptr, nullptr, nullptr,
                           nullptr, nullptr);
        };
        const std::unique_ptr<void, decltype(destroy_provider)> owner(object, destroy_provider);
        const Ref<Instance> model(create(provider->meta_class, true));
        return provider->proc(provider, OP_ENUM_INSTANCES, object, model.ptr(),
                              reinterpret_cast<void*>(&receive), &receiver, nullptr, nullptr, nullptr,
                              nullptr);
    }

    static bool receive(Instance* instance, int status, void* data)
    {
        const auto* receiver = static_cast<const Receiver*>(data);
        if (instance && receiver->result)
            receiver->result->pairs.push_back(told_ends(instance, receiver->roles));
        else if (receiver->result)
            receiver->result->end_marks.push_back(status);
        destroyer(instance);
        return instance != nullptr;
    }

    static std::string told_ends(const Instance* association, const std::vector<std::string>& roles)
    {
        std::string text;
        for (const std::string& role : roles) {
            const Meta_Feature* feature =
                find_feature(association->__meta_class, role.c_str(), FLAG_REFERENCE);
            if (!feature)
                throw std::invalid_argument(std::string(association->__meta_class->name) + " has no " + role);
            const Instance* end =
                cell_at<Instance*>(association, static_cast<const Meta_Reference*>(feature)->offset);
            text += (text.empty() ? "" : " ") + (end ? label_of(end) : "(null)");
            EXPECT_TRUE(!end || is_whole(end)) << label_of(end) << " lost something";
        }
        return text;
    }

    /// Equal in all its properties to an element of the script.
    static bool is_whole(const Instance* end)
    {
        for (const auto& [name, list] : managers_script.lists) {
            for (const Instance* element : list) {
                if (element->__meta_class == end->__meta_class && identical(element, end))
                    return true;
            }
        }
        return false;
    }

    Lines said_by(const std::string& file) const
    {
        Lines lines = told(log.lines(), [&](const Log_Line& line) { return line.file == file; });
        if (lines.size() < 2 || lines.front() != "DBG Entering: enum_instances" ||
            lines.back() != "DBG Returning: enum_instances") {
            ADD_FAILURE() << "not traced: " << ::testing::PrintToString(lines);
            return lines;
        }
        return Lines(lines.begin() + 1, lines.end() - 1);
    }
};

} // namespace KPRV
