#pragma once

#include "broker/values/Class_Catalogue.h"
#include "module/runtime/dispatch/Registration.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <memory>
#include <unordered_map>

namespace KPRV::broker {

/// Reads the classes out of the metadata tables that a module publishes through `cimple_module`. The tables
/// must outlive the catalogue; a class is read when it is first asked for. Safe for any thread.
class Registration_Catalogue final : public Class_Catalogue
{
public:
    explicit Registration_Catalogue(const Registration* head);
    ~Registration_Catalogue() override;

    std::vector<std::string> class_names() const override { return _names; }
    const Class_Info* find(std::string_view name) const override;
    std::string module_name() const override { return _module_name; }
    bool is_a(std::string_view class_name, std::string_view ancestor) const override;

private:
    struct Slot
    {
        const Meta_Class* meta_class = nullptr;
        bool has_provider = false;
        std::unique_ptr<Class_Info> info;
    };

    /// Whatever the letters' case.
    struct Name_Hash
    {
        using is_transparent = void;
        std::size_t operator()(std::string_view name) const;
    };
    struct Same_Name
    {
        using is_transparent = void;
        bool operator()(std::string_view a, std::string_view b) const { return same_name(a, b); }
    };

    void add(const Meta_Class* meta_class) REQUIRES(_mutex);
    const Meta_Class* meta_class(std::string_view name) const;

    std::string _module_name;
    std::vector<std::string> _names;
    mutable Standard_Mutex<> _mutex;
    mutable std::unordered_map<std::string, Slot, Name_Hash, Same_Name> _slots GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
