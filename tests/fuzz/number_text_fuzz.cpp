// Any text as a number of each type: what reads is written back as a text that reads as the same number, and
// what does not read leaves the value alone.
#include "module/runtime/text/number_text.h"
#include "tests/fuzz/Fuzz_Target.h"

#include <string>

using namespace KPRV;

namespace {

template <class Number>
void round_trip(const char* text, int (*parse)(const char*, Number&),
                const char* (*format)(char*, Number, size_t&))
{
    constexpr Number UNTOUCHED = 77;
    Number value = UNTOUCHED;
    if (parse(text, value) != 0) {
        FUZZ_EXPECT(value == UNTOUCHED);
        return;
    }
    char buffer[NUMBER_TEXT_SIZE];
    size_t size = 0;
    const std::string written = format(buffer, value, size);
    FUZZ_EXPECT(written.size() == size);
    Number again = UNTOUCHED;
    FUZZ_EXPECT(parse(written.c_str(), again) == 0 && again == value);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::string copy(reinterpret_cast<const char*>(data), size);
    const char* const text = copy.c_str();
    round_trip(text, str_to_uint8, uint8_to_str);
    round_trip(text, str_to_uint16, uint16_to_str);
    round_trip(text, str_to_uint32, uint32_to_str);
    round_trip(text, str_to_uint64, uint64_to_str);
    round_trip(text, str_to_sint8, sint8_to_str);
    round_trip(text, str_to_sint16, sint16_to_str);
    round_trip(text, str_to_sint32, sint32_to_str);
    round_trip(text, str_to_sint64, sint64_to_str);
    real32 narrow = 0;
    real64 wide = 0;
    FUZZ_EXPECT((str_to_real32(text, narrow) == 0) == (str_to_real64(text, wide) == 0));
    boolean truth = false;
    str_to_boolean(text, truth);
    const char* start = text;
    const char* end = text;
    for (const char* at = text; find_token(at, " ,;", start, end) == 0; at = end)
        FUZZ_EXPECT(start < end && end <= text + copy.size());
    return 0;
}
