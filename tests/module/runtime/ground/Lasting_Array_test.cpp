#include "module/runtime/ground/Lasting_Array.h"

#include "module/runtime/ground/String.h"
#include "tests/module/runtime/objects/sample_values.h"

using namespace KPRV;

namespace {

const Lasting_Array<String> words = {"one", "two"};

const void* place(const Array<String>& array)
{
    return array.data();
}

const Array<String>& lasting()
{
    return words;
}

void expect_untouched()
{
    ASSERT_EQ(lasting().size(), 2u);
    EXPECT_EQ(lasting()[0], String("one"));
    EXPECT_EQ(lasting()[1], String("two"));
}

} // namespace

TEST(Lasting_Array, IsSharedByItsCopies)
{
    const Array<String> copy = words, again = copy;
    EXPECT_EQ(place(copy), place(words));
    EXPECT_EQ(place(again), place(words));
    EXPECT_TRUE(copy == lasting());
}

TEST(Lasting_Array, IsNotWhatACopyWritesTo)
{
    using Write = void (*)(Array<String>&);
    const Write writes[] = {
        [](Array<String>& x) { x[0] = "three"; },
        [](Array<String>& x) { *x.begin() = "three"; },
        [](Array<String>& x) { x.append("three"); },
        [](Array<String>& x) { x.prepend(x.data()[1]); },
        [](Array<String>& x) { x.insert(1, "three"); },
        [](Array<String>& x) { x.remove(0); },
        [](Array<String>& x) { x.clear(); },
        [](Array<String>& x) { x.resize(1, String()); },
        [](Array<String>& x) { x.resize(3, String("three")); },
        [](Array<String>& x) { x.reserve(8); },
        [](Array<String>& x) { x = Array<String>(); },
    };
    for (const Write write : writes) {
        Array<String> copy = words;
        write(copy);
        EXPECT_NE(place(copy), place(words));
        expect_untouched();
    }
}

TEST(Lasting_Array, GivesACopyAllItsElementsBeforeTheWrite)
{
    Array<String> copy = words;
    copy.append("three");
    ASSERT_EQ(copy.size(), 3u);
    EXPECT_EQ(copy[0], String("one"));
    EXPECT_EQ(copy[2], String("three"));
    EXPECT_GE(copy.capacity(), 3u);
}

TEST(Lasting_Array, GoesThroughInstances)
{
    const Ref<Sample_Element> element(make_element("e"));
    element->Words.set(words);
    const Ref<Sample_Element> copy(clone_of(element.ptr()));
    EXPECT_EQ(place(std::as_const(*copy).Words.value), place(words));
    EXPECT_TRUE(identical(element.ptr(), copy.ptr()));
    clear(copy.ptr());
    EXPECT_EQ(copy->Words.value.size(), 0u);
    expect_untouched();
}
