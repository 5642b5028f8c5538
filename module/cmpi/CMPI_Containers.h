#pragma once

#include "module/cmpi/Shared_Ends.h"
#include "module/runtime/objects/Container.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV {

/// What the three containers of the server share: a list of named `CMPIData` that can be read by index and
/// written by name. They live on the stack for one conversion.
class CMPI_Container : public Container
{
public:
    uint32 get_size() override;
    int get_name(uint32 index, String& name) override;
    const char* peek_name(uint32 index, String& hold) override;
    int get_value(uint32 index, Value::Type type, Value& value) override;
    int get_reference(uint32 index, const Meta_Reference* reference, Value::Type type, Value& value) override;
    int set_value(const char* name, const Value& value, uint32 flags) final;

    /// From now on the objects that `set_value` makes are given back once they have been set, which copies
    /// them. For a thread that no request's end cleans up behind.
    void give_back_what_is_made() { _gives_back = true; }

    /// How many references and embedded instances the object lies in.
    void lies_in(unsigned depth) { _depth = depth; }

    /// Paths of references are taken from there and noted there. Null for none.
    void share(Shared_Ends* ends) { _ends = ends; }

protected:
    CMPI_Container(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space)
        : Container(repository), _broker(broker), _name_space(name_space)
    {
    }

    virtual CMPICount _count() = 0;
    virtual CMPIData _at(CMPICount index, CMPIString** name) = 0;
    /// 0, or -1 with a log line.
    virtual int _set(const char* name, const CMPIData& data) = 0;
    /// Lets a value pass as one of another type where servers are known to send it so.
    virtual void _relax(Value::Type type, Value& value);

    /// `put_cells` of the container, whose own type tells where its `_set` is.
    template <class Final>
    void _put_cells(Final& container, const Instance* instance, uint32 mask);
    /// One cell. The short ways, which nearly all properties go, are made here.
    template <class Final>
    int _put_cell(Final& container, const Instance* instance, const Cell& cell);
    /// The path of a reference, if it is known.
    bool _find_end(const Instance* instance, const Cell& cell, CMPIData& data) const;
    /// The same made, and noted: 0 or -1.
    int _make_end(const Instance* instance, const Cell& cell, CMPIData& data);

    bool _in_bounds(uint32 index);
    /// -1, with a log line.
    static int _not_made(const char* name);

    const CMPIBroker* _broker;
    const char* _name_space;

private:
    /// `wanted`: what an instance must be of, if that is known.
    int _get(uint32 index, Value::Type type, const Meta_Class* wanted, Value& value);

    bool _gives_back = false;
    unsigned _depth = 0;
    Shared_Ends* _ends = nullptr;
};

class CMPIInstance_Container final : public CMPI_Container
{
public:
    CMPIInstance_Container(const Meta_Repository* repository, const CMPIBroker* broker,
                           const char* name_space, const CMPIInstance* instance)
        : CMPI_Container(repository, broker, name_space), _instance(instance)
    {
    }
    /// The only reader that is guarded against a throwing server.
    const char* peek_name(uint32 index, String& hold) override;

protected:
    void put_cells(const Instance* instance, uint32 mask) override;
    friend CMPI_Container;
    CMPICount _count() override;
    CMPIData _at(CMPICount index, CMPIString** name) override;
    int _set(const char* name, const CMPIData& data) override;

private:
    const CMPIInstance* _instance;
};

class CMPIObjectPath_Container final : public CMPI_Container
{
public:
    CMPIObjectPath_Container(const Meta_Repository* repository, const CMPIBroker* broker,
                             const char* name_space, const CMPIObjectPath* path)
        : CMPI_Container(repository, broker, name_space), _path(path)
    {
    }

protected:
    void put_cells(const Instance* instance, uint32 mask) override;
    friend CMPI_Container;
    CMPICount _count() override;
    CMPIData _at(CMPICount index, CMPIString** name) override;
    int _set(const char* name, const CMPIData& data) override;
    /// Servers hand integer keys as 64-bit numbers.
    void _relax(Value::Type type, Value& value) override;

private:
    const CMPIObjectPath* _path;
};

class CMPIArgs_Container final : public CMPI_Container
{
public:
    CMPIArgs_Container(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space,
                       const CMPIArgs* args)
        : CMPI_Container(repository, broker, name_space), _args(args)
    {
    }
    /// Where a feature named exactly "return_value" goes, which is no argument. Type 0 until then.
    CMPIData return_value = {};

protected:
    void put_cells(const Instance* instance, uint32 mask) override;
    friend CMPI_Container;
    CMPICount _count() override;
    CMPIData _at(CMPICount index, CMPIString** name) override;
    int _set(const char* name, const CMPIData& data) override;
    /// Servers send a null array without a type as a boolean.
    void _relax(Value::Type type, Value& value) override;

private:
    const CMPIArgs* _args;
};

} // namespace KPRV
