#include "module/runtime/objects/Wanted.h"
#include "tests/module/runtime/objects/sample_values.h"

using namespace KPRV;

namespace {

const Wanted everything;

/// A link from an element to a port, by their names.
Ref<Sample_Link> linked(const char* element, const char* port)
{
    Ref<Sample_Link> link(create<Sample_Link>(true));
    link->Antecedent = make_element(element);
    link->Dependent = make_port(port);
    return link;
}

bool may_be(const Wanted& wanted, const char* name)
{
    const std::string_view text = name;
    return wanted.may_be(&Sample_Port::Name, {&text, 1});
}

} // namespace

TEST(Wanted, EverythingIsWholeAndOfAnyName)
{
    EXPECT_TRUE(everything.whole());
    EXPECT_TRUE(may_be(everything, "a"));
    EXPECT_FALSE(Wanted::names().whole());
    EXPECT_TRUE(may_be(Wanted::names(), "a"));
}

TEST(Wanted, AnObjectIsToldByTheKeyToTheLastLetter)
{
    const Ref<Sample_Port> model(make_port("name"));
    const Wanted wanted = Wanted::object(model.ptr());
    EXPECT_TRUE(wanted.whole());
    EXPECT_TRUE(may_be(wanted, "name"));
    for (const char* other : {"", "nam", "names", "Name", "other"})
        EXPECT_FALSE(may_be(wanted, other)) << other;
}

TEST(Wanted, AKeyMayBeGivenInParts)
{
    const Ref<Sample_Port> model(make_port("port_7"));
    const Wanted wanted = Wanted::object(model.ptr());
    const auto may_be = [&](auto... parts) {
        const std::string_view texts[] = {parts...};
        return wanted.may_be(&Sample_Port::Name, texts);
    };
    EXPECT_TRUE(may_be("port", "_", "7"));
    EXPECT_TRUE(may_be("", "port_7", ""));
    EXPECT_FALSE(may_be("port", "_"));
    EXPECT_FALSE(may_be("port", "_", "7", "7"));
    EXPECT_FALSE(may_be("port", "7", "_"));
}

TEST(Wanted, TheBeginningOfAKeyTellsMostObjectsApart)
{
    const Ref<Sample_Port> model(make_port("port_7"));
    const auto may_begin = [](const Wanted& wanted, std::string_view beginning) {
        return wanted.may_begin_with(&Sample_Port::Name, beginning);
    };
    for (const char* beginning : {"", "p", "port_", "port_7"})
        EXPECT_TRUE(may_begin(Wanted::object(model.ptr()), beginning)) << beginning;
    for (const char* other : {"P", "ort", "port_78"})
        EXPECT_FALSE(may_begin(Wanted::object(model.ptr()), other)) << other;
    EXPECT_TRUE(may_begin(Wanted(), "q"));
    EXPECT_TRUE(may_begin(Wanted::names(), "q"));
    model->Name.null = 1;
    EXPECT_TRUE(may_begin(Wanted::object(model.ptr()), "q"));
}

TEST(Wanted, ANullKeyOrAnotherClassTellsNothing)
{
    const Ref<Sample_Port> model(make_port("name"));
    model->Name.null = 1;
    EXPECT_TRUE(may_be(Wanted::object(model.ptr()), "other"));
    const Ref<Sample_Group> group = make_group("name");
    EXPECT_TRUE(may_be(Wanted::object(group.ptr()), "other"));
}

TEST(Wanted, AnAssociationTellsItsEnds)
{
    const Ref<Sample_Link> model = linked("e", "p");
    const Wanted end = Wanted::object(model.ptr()).end<Sample_Port>(&Sample_Link::Dependent);
    EXPECT_FALSE(end.whole());
    EXPECT_TRUE(may_be(end, "p"));
    EXPECT_FALSE(may_be(end, "q"));
}

TEST(Wanted, AnEndThatIsNotSetOrOfAnotherClassIsAny)
{
    const Ref<Sample_Link> model(create<Sample_Link>(true)), full = linked("e", "p");
    for (const Wanted& end : {Wanted::object(model.ptr()).end<Sample_Port>(&Sample_Link::Dependent),
                              everything.end<Sample_Port>(&Sample_Link::Dependent),
                              Wanted::object(full.ptr()).end<Sample_Group>(&Sample_Link::Dependent)}) {
        EXPECT_FALSE(end.whole());
        EXPECT_TRUE(may_be(end, "q"));
    }
}

TEST(Wanted, BesideAnEndThatIsNotTheAssociationsNothingIsWanted)
{
    const Ref<Sample_Link> model = linked("e", "p");
    const Ref<Sample_Element> own(make_element("e")), other(make_element("f"));
    const auto beside = [&](const Instance* end) {
        return Wanted::object(model.ptr())
            .beside<Sample_Port>(end, &Sample_Link::Antecedent, &Sample_Link::Dependent);
    };
    EXPECT_TRUE(may_be(beside(own.ptr()), "p"));
    EXPECT_FALSE(may_be(beside(own.ptr()), "q"));
    EXPECT_FALSE(may_be(beside(other.ptr()), "p"));
}

TEST(Wanted, WhatDoesNotSayItsClassMayBeAnyEnd)
{
    // A port without a `CreationClassName`: an element could have its keys.
    const Ref<Sample_Port> port(make_port("p"));
    const Wanted touching = Wanted::touching(port.ptr());
    EXPECT_TRUE(may_be(touching.end<Sample_Port>(&Sample_Link::Dependent), "q"));
    EXPECT_TRUE(may_be(touching, "q"));
}
