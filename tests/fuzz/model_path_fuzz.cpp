// Any text as the name of an object: what reads reads the same once it is written, if it is.
#include "module/runtime/objects/Model_Path.h"
#include "module/runtime/objects/Ref.h"
#include "tests/fuzz/Bytes.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/fuzz/Product_Classes.h"

using namespace KPRV;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::string text(reinterpret_cast<const char*>(data), size);
    const Ref<Instance> first(model_path_to_instance(&KALDERA_FCPort::static_meta_class, text.c_str()));
    if (!first)
        return 0;
    String written;
    if (instance_to_model_path(first.ptr(), written) != 0)
        return 0;
    // A quote or a backslash inside a text is written as it stands, and does not read back as the same.
    if (text.find('\\') != std::string::npos)
        return 0;
    const Ref<Instance> second(model_path_to_instance(&KALDERA_FCPort::static_meta_class, written.c_str()));
    FUZZ_EXPECT(second && key_eq(first.ptr(), second.ptr()));
    return 0;
}
