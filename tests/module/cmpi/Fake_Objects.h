#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <string>
#include <vector>

namespace KPRV {

// Objects of a server that hands out what no good server does: missing texts, wrong elements.

/// A text, or none.
struct Fake_String
{
    explicit Fake_String(const char* x) : cmpi{this, &table}, text(x) {}
    Fake_String(const Fake_String&) = delete;
    Fake_String& operator=(const Fake_String&) = delete;

    static const char* get(const CMPIString* self, CMPIStatus*)
    {
        return static_cast<const Fake_String*>(self->hdl)->text;
    }
    static constexpr CMPIStringFT table = {100, nullptr, nullptr, get};

    CMPIString cmpi;
    const char* text;
};

/// A datetime whose text is any, or missing, or fails.
struct Fake_Datetime
{
    explicit Fake_Datetime(const char* text, CMPIrc code = CMPI_RC_OK)
        : cmpi{this, &table}, string(text), has_string(text), rc(code)
    {
    }
    Fake_Datetime(const Fake_Datetime&) = delete;
    Fake_Datetime& operator=(const Fake_Datetime&) = delete;

    static CMPIString* get(const CMPIDateTime* self, CMPIStatus* rc)
    {
        auto* const fake = static_cast<Fake_Datetime*>(self->hdl);
        if (rc)
            *rc = {fake->rc, nullptr};
        return fake->has_string ? &fake->string.cmpi : nullptr;
    }
    static constexpr CMPIDateTimeFT table = {100, nullptr, nullptr, nullptr, get, nullptr};

    CMPIDateTime cmpi;
    Fake_String string;
    bool has_string;
    CMPIrc rc;
};

/// An array of any elements.
struct Fake_Array
{
    explicit Fake_Array(std::vector<CMPIData> x) : cmpi{this, &table}, elements(std::move(x)) {}
    Fake_Array(const Fake_Array&) = delete;
    Fake_Array& operator=(const Fake_Array&) = delete;

    static CMPICount size(const CMPIArray* self, CMPIStatus*)
    {
        return CMPICount(static_cast<const Fake_Array*>(self->hdl)->elements.size());
    }
    static CMPIData get(const CMPIArray* self, CMPICount index, CMPIStatus*)
    {
        return static_cast<const Fake_Array*>(self->hdl)->elements.at(index);
    }
    static constexpr CMPIArrayFT table = {100, nullptr, nullptr, size, nullptr, get, nullptr};

    CMPIArray cmpi;
    std::vector<CMPIData> elements;
};

inline CMPIData fake_data(CMPIType type, CMPIValueState state = CMPI_goodValue)
{
    CMPIData data = {};
    data.type = type;
    data.state = state;
    return data;
}

inline CMPIData fake_data(const Fake_String& x)
{
    CMPIData data = fake_data(CMPI_string);
    data.value.string = const_cast<CMPIString*>(&x.cmpi);
    return data;
}

inline CMPIData fake_data(const Fake_Datetime& x)
{
    CMPIData data = fake_data(CMPI_dateTime);
    data.value.dateTime = const_cast<CMPIDateTime*>(&x.cmpi);
    return data;
}

inline CMPIData fake_data(CMPIType element_type, const Fake_Array& x)
{
    CMPIData data = fake_data(CMPIType(element_type | CMPI_ARRAY));
    data.value.array = const_cast<CMPIArray*>(&x.cmpi);
    return data;
}

} // namespace KPRV
