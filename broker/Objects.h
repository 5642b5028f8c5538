#pragma once

#include "broker/Core.h"
#include "broker/values/Receiver.h"

#include <cstddef>
#include <optional>

namespace KPRV::broker {

struct String_Object;
struct Array_Object;
struct Enumeration_Object;
struct Instance_Object;
struct Path_Object;
struct Args_Object;
struct Datetime_Object;
struct Context_Object;
struct Result_Object;
struct Select_Object;

/// The function table of each kind.
extern const CMPIStringFT string_table;
extern const CMPIArrayFT array_table;
extern const CMPIEnumerationFT enumeration_table;
extern const CMPIInstanceFT instance_table;
extern const CMPIObjectPathFT path_table;
extern const CMPIArgsFT args_table;
extern const CMPIDateTimeFT datetime_table;
extern const CMPIContextFT context_table;
extern const CMPIResultFT result_table;
extern const CMPISelectExpFT select_table;

/// To be assigned nothing leaves texts and lists the room that they had.
template <class Content>
void free_all(Content& content)
{
    const Content gone = std::move(content);
}

struct String_Object final : Object_Of<CMPIString, Object_Kind::STRING>
{
    String_Object(Core& owner_core, std::string_view text) : Object_Of(owner_core, string_table)
    {
        hold(text);
    }
    /// A string whose text pointer is null, as some servers hand out.
    String_Object(Core& owner_core, std::nullptr_t) : Object_Of(owner_core, string_table) {}
    String_Object(Core& owner_core, const String_Object& other) : Object_Of(owner_core, string_table)
    {
        if (other.has_text())
            hold(other.held());
    }

    bool has_text() const { return holds(); }
    std::string text() const { return std::string(held()); }
};

struct Array_Object final : Object_Of<CMPIArray, Object_Kind::ARRAY>
{
    struct Element
    {
        Plain_Value value;
        /// The provider's object that was set, null for plain values: servers keep only this pointer.
        const void* object = nullptr;
    };

    Array_Object(Core& owner_core, CMPIType type, std::size_t size);
    /// Elements of an array value.
    Array_Object(Core& owner_core, const Plain_Value& value);
    Array_Object(Core& owner_core, const Array_Object& other)
        : Object_Of(owner_core, array_table), element_type(other.element_type), elements(other.elements)
    {
    }
    void drop() override
    {
        let_go();
        free_all(elements);
    }
    bool pack() override;
    void unpack() override;

    CMPIType element_type;
    std::vector<Element> elements;
};

struct Enumeration_Object final : Object_Of<CMPIEnumeration, Object_Kind::ENUMERATION>
{
    Enumeration_Object(Core& owner_core, std::vector<Plain_Value> values)
        : Object_Of(owner_core, enumeration_table), elements(std::move(values))
    {
    }
    Enumeration_Object(Core& owner_core, const Enumeration_Object& other)
        : Object_Of(owner_core, enumeration_table), elements(other.elements), next(other.next)
    {
    }
    void drop() override { elements.clear(); }

    /// All instances or all references.
    std::vector<Plain_Value> elements;
    std::size_t next = 0;
};

/// The class of an object, looked up when it is first asked for.
class Known_Class
{
public:
    const Class_Info* get(const Core& core, const std::string& class_name) const
    {
        if (!_is_known)
            _info = core.catalogue->find(class_name);
        _is_known = true;
        return _info;
    }
    /// The object has another one.
    void forget() { _is_known = false; }

private:
    mutable const Class_Info* _info = nullptr;
    mutable bool _is_known = false;
};

struct Instance_Object final : Object_Of<CMPIInstance, Object_Kind::INSTANCE>
{
    Instance_Object(Core& owner_core, Instance_Value instance)
        : Object_Of(owner_core, instance_table), content(std::move(instance))
    {
    }
    Instance_Object(Core& owner_core, const Instance_Object& other)
        : Object_Of(owner_core, instance_table), content(other.content), filter(other.filter)
    {
    }
    void drop() override
    {
        let_go();
        free_all(content);
    }
    bool pack() override;
    void unpack() override;

    /// The instance as a server would read it: the keys of the path follow the key properties, and an early
    /// filter has taken its keys.
    Instance_Value value() const;
    Path_Value path() const;

    const Class_Info* info() const { return known_class.get(core, content.path.class_name); }

    Instance_Value content;
    std::optional<std::vector<std::string>> filter;
    Known_Class known_class;
};

struct Path_Object final : Object_Of<CMPIObjectPath, Object_Kind::PATH>
{
    Path_Object(Core& owner_core, Path_Value path, bool from_client = false);
    Path_Object(Core& owner_core, const Path_Object& other)
        : Object_Of(owner_core, path_table), content(other.content), key_state(other.key_state)
    {
    }
    void drop() override
    {
        let_go();
        free_all(content);
    }
    bool pack() override;
    void unpack() override;

    const Class_Info* info() const { return known_class.get(core, content.class_name); }

    Path_Value content;
    Known_Class known_class;
    /// State bits that all keys carry.
    CMPIValueState key_state = CMPI_goodValue;
};

struct Args_Object final : Object_Of<CMPIArgs, Object_Kind::ARGS>
{
    explicit Args_Object(Core& owner_core, std::vector<Named_Value> values = {})
        : Object_Of(owner_core, args_table), content(std::move(values))
    {
    }
    Args_Object(Core& owner_core, const Args_Object& other)
        : Object_Of(owner_core, args_table), content(other.content)
    {
    }
    void drop() override { content.clear(); }

    std::vector<Named_Value> content;
};

struct Datetime_Object final : Object_Of<CMPIDateTime, Object_Kind::DATETIME>
{
    Datetime_Object(Core& owner_core, std::string_view text) : Object_Of(owner_core, datetime_table)
    {
        hold(text);
    }
    Datetime_Object(Core& owner_core, const Datetime_Object& other)
        : Datetime_Object(owner_core, other.held())
    {
    }

    /// 25 characters.
    std::string text() const { return std::string(held()); }
};

struct Context_Object final : Object_Of<CMPIContext, Object_Kind::CONTEXT>
{
    explicit Context_Object(Core& owner_core, std::vector<Named_Value> values = {},
                            bool null_principal = false)
        : Object_Of(owner_core, context_table), entries(std::move(values)),
          principal_without_text(null_principal)
    {
    }
    Context_Object(Core& owner_core, const Context_Object& other)
        : Object_Of(owner_core, context_table), entries(other.entries),
          principal_without_text(other.principal_without_text)
    {
    }
    void drop() override { entries.clear(); }

    std::vector<Named_Value> entries;
    bool principal_without_text;
    /// A context from `CBPrepareAttachThread`, and whether a thread is attached with it.
    bool prepared = false;
    std::atomic<bool> attached = false;
};

struct Result_Object final : Object_Of<CMPIResult, Object_Kind::RESULT>
{
    /// What the operation may return.
    enum Accepts : unsigned
    {
        INSTANCES = 1,
        PATHS = 2,
        DATA = 4,
    };

    Result_Object(Core& owner_core, unsigned what, Receiver& results)
        : Object_Of(owner_core, result_table), accepts(what), receiver(results)
    {
    }
    Result_Object(Core& owner_core, const Result_Object& other)
        : Object_Of(owner_core, result_table), accepts(other.accepts), receiver(other.receiver)
    {
    }
    void drop() override {}

    unsigned accepts;
    Receiver& receiver;
    /// It has had enough.
    bool stopped = false;
    std::vector<Plain_Value> data;
    unsigned done_count = 0;
};

/// The query is kept, never evaluated.
struct Select_Object final : Object_Of<CMPISelectExp, Object_Kind::SELECT_EXP>
{
    Select_Object(Core& owner_core, std::string query_text, std::string language_name)
        : Object_Of(owner_core, select_table), query(std::move(query_text)),
          language(std::move(language_name))
    {
    }
    Select_Object(Core& owner_core, const Select_Object& other)
        : Object_Of(owner_core, select_table), query(other.query), language(other.language)
    {
    }
    void drop() override {}

    std::string query;
    std::string language;
};

} // namespace KPRV::broker
