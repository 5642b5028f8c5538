#pragma once

#include "broker/values/Plain_Value.h"

namespace KPRV::broker {

/// Writes values as bytes, a tenth of what they take as objects: for what is kept and rarely looked at. Only
/// the process that wrote them can read them.
class Byte_Writer
{
public:
    void number(std::uint64_t number);
    void text(std::string_view text);
    void value(const Plain_Value& value);
    void values(const std::vector<Named_Value>& values);
    void path(const Path_Value& path);
    void instance(const Instance_Value& instance);

    const std::string& bytes() const { return _bytes; }

private:
    std::string _bytes;
};

/// Reads them back, in the order in which they were written.
class Byte_Reader
{
public:
    explicit Byte_Reader(std::string_view bytes) : _rest(bytes) {}

    std::uint64_t number();
    std::string text();
    Plain_Value value();
    std::vector<Named_Value> values();
    Path_Value path();
    Instance_Value instance();

private:
    std::string_view _rest;
};

} // namespace KPRV::broker
