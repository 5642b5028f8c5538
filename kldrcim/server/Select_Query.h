#pragma once

#include "broker/values/Class_Catalogue.h"

#include <memory>
#include <optional>

namespace KPRV::kldrcim {

using namespace broker;

/// What is wrong with a query: status 14 for its language, 15 for itself.
struct Query_Error
{
    CMPIrc rc = CMPI_RC_OK;
    std::string text;
};

/// A query of a subscription, or for instances, in WQL or in the part of DMTF:CQL that looks the same:
///
///     SELECT *|NAME[, NAME...] FROM CLASS [WHERE CONDITION]
///
/// A condition compares a property with a text, number, TRUE, FALSE or NULL (= <> != < <= > >= LIKE, IS [NOT]
/// NULL), or asks what class an embedded instance is of (ISA); with AND, OR, NOT and parentheses. What is
/// null compares to neither true nor false, as in SQL.
class Select_Query
{
public:
    /// Nothing with `error` for a query that cannot be understood.
    static std::optional<Select_Query> parse(const std::string& text, const std::string& language,
                                             Query_Error& error);

    const std::string& class_name() const { return _class_name; }
    /// What is asked for; nothing for all.
    const std::vector<std::string>& properties() const { return _properties; }
    /// The first name, of those that are asked for or compared, that is no property of the class; empty if
    /// there is none.
    std::string unknown_property(const Class_Info& info) const;

    bool matches(const Instance_Value& instance, const Class_Catalogue& classes) const;
    /// Drops the properties that are not asked for, but for those of an indication's sequence.
    void project(Instance_Value& instance) const;

    class Condition;

private:
    friend class Query_Parser;

    std::string _class_name;
    std::vector<std::string> _properties;
    std::vector<std::string> _compared;
    std::shared_ptr<const Condition> _condition;
};

} // namespace KPRV::kldrcim
