#pragma once

#include "module/runtime/dispatch/Thread_Context.h"

#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace KPRV {

/// Notes of several threads, in order.
class Notes
{
public:
    void add(const std::string& note)
    {
        const std::lock_guard lock(_mutex);
        _list.push_back(note);
    }
    std::vector<std::string> list() const
    {
        const std::lock_guard lock(_mutex);
        return _list;
    }

private:
    mutable std::mutex _mutex;
    std::vector<std::string> _list;
};

/// A context that notes what is asked of it and answers as told.
class Recording_Context : public Thread_Context
{
public:
    explicit Recording_Context(Notes& notes, const char* name = "") : _notes(notes), _name(name) {}
    ~Recording_Context() override { note("gone"); }

    void* thread_create_hook(void*) override
    {
        note("create");
        child = new Recording_Context(_notes, "child ");
        if (child_at)
            *child_at = child;
        return static_cast<Thread_Context*>(child);
    }
    void thread_start_hook() override { note("start"); }
    void thread_exit_hook() override { note("exit"); }

    Instance_Enumerator_Rep* instance_enumerator_create(const char* name_space, const Instance*) override
    {
        note(std::string("enum ") + name_space);
        return next_rep;
    }
    void instance_enumerator_destroy(Instance_Enumerator_Rep*) override { note("destroy"); }
    bool instance_enumerator_more(Instance_Enumerator_Rep* rep) override { return rep && !results.empty(); }
    void instance_enumerator_next(Instance_Enumerator_Rep*) override { results.pop_back(); }
    Ref<Instance> instance_enumerator_get(Instance_Enumerator_Rep*) override
    {
        return results.empty() ? Ref<Instance>() : results.back();
    }

    Ref<Instance> get_instance(const char* name_space, const Instance*) override
    {
        note(std::string("get ") + name_space);
        return results.empty() ? Ref<Instance>() : results.back();
    }
    int create_instance(const char*, const Instance*) override { return answer("create instance"); }
    int delete_instance(const char*, const Instance*) override { return answer("delete instance"); }
    int modify_instance(const char*, const Instance*) override { return answer("modify instance"); }
    int invoke_method(const char*, const Instance*, Instance*) override { return answer("invoke"); }
    void allow_unload(bool flag) override { note(flag ? "allow" : "refuse"); }
    bool get_username(String& name) override
    {
        name = "root";
        return true;
    }

    /// The word behind the table pointer: the context below this one on its stack.
    const void* link() const { return reinterpret_cast<void* const*>(this)[1]; }

    Recording_Context* child = nullptr;
    /// Takes the child too, for when this context does not live to tell.
    Recording_Context** child_at = nullptr;
    Instance_Enumerator_Rep* next_rep = reinterpret_cast<Instance_Enumerator_Rep*>(this);
    std::vector<Ref<Instance>> results;
    int status = 0;

private:
    void note(const std::string& what) { _notes.add(_name + what); }
    int answer(const char* what)
    {
        note(what);
        return status;
    }

    Notes& _notes;
    std::string _name;
};

using Notes_List = std::vector<std::string>;

/// Pushes a context for a scope. The stack does not own it.
class Pushed
{
public:
    explicit Pushed(Thread_Context* context) { Thread_Context::push(context); }
    ~Pushed() { Thread_Context::pop(); }
    Pushed(const Pushed&) = delete;
    Pushed& operator=(const Pushed&) = delete;
};

} // namespace KPRV
