#include "broker/Server_Store.h"

#include "broker/values/Class_Catalogue.h"

#include <gtest/gtest.h>

namespace KPRV::broker {
namespace {

TEST(Server_Store, NameSpacesAndClassesWithoutCase)
{
    Server_Store store;
    No_Catalogue catalogue;
    store.add("Root/Interop", {.path = {.class_name = "CIM_A"}});
    store.add_name_space("root/empty");
    EXPECT_TRUE(store.has_name_space("root/interop"));
    EXPECT_TRUE(store.has_name_space("root/empty"));
    EXPECT_FALSE(store.has_name_space("root"));
    EXPECT_TRUE(store.serves(catalogue, {.name_space = "ROOT/INTEROP", .class_name = "cim_a"}));
    EXPECT_FALSE(store.serves(catalogue, {.name_space = "root/empty", .class_name = "CIM_A"}));
    EXPECT_EQ("Root/Interop", store.instances("root/interop").at(0).path.name_space);
}

TEST(Server_Store, AClassWithoutInstancesIsThere)
{
    Server_Store store;
    No_Catalogue catalogue;
    store.add_class("Root/Interop", "CIM_A");
    EXPECT_TRUE(store.has_name_space("root/interop"));
    const Path_Value path = {.name_space = "root/interop", .class_name = "cim_a"};
    EXPECT_TRUE(store.serves(catalogue, path));
    EXPECT_FALSE(store.serves(catalogue, {.name_space = "root/interop", .class_name = "CIM_B"}));
    const Result result = store.run(catalogue, {.path = path});
    EXPECT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_TRUE(result.instances.empty());
}

TEST(Server_Store, SuperclassesOfItsOwnClasses)
{
    Server_Store store;
    No_Catalogue catalogue;
    store.add_class("n", "PG_A", "CIM_A");
    store.add_class("n", "PG_B", "pg_a");
    // What is said again without a superclass does not take it away.
    store.add_class("n", "PG_B");
    const auto found = [&](const char* class_name) {
        return store.run(catalogue, {.path = {.name_space = "n", .class_name = class_name}}).instances.size();
    };
    EXPECT_TRUE(store.serves(catalogue, {.name_space = "n", .class_name = "CIM_A"}));
    store.add("n", {.path = {.class_name = "PG_B"}});
    EXPECT_EQ(1u, found("CIM_A"));
    EXPECT_EQ(1u, found("PG_A"));
    EXPECT_EQ(1u, found("PG_B"));
    EXPECT_EQ(0u, found("CIM_B"));
    // Another name space has its own classes.
    store.add("m", {.path = {.class_name = "PG_B"}});
    EXPECT_FALSE(store.serves(catalogue, {.name_space = "m", .class_name = "CIM_A"}));
    // A circle comes to an end.
    store.add_class("n", "CIM_A", "PG_B");
    EXPECT_FALSE(store.serves(catalogue, {.name_space = "n", .class_name = "CIM_B"}));
}

TEST(Server_Store, ANameSpaceRefusesAll)
{
    Server_Store store;
    No_Catalogue catalogue;
    store.add("n", {.path = {.class_name = "C"}});
    store.refuse("N", CMPI_RC_ERR_ACCESS_DENIED);
    for (const char* class_name : {"C", "D"}) {
        const Path_Value path = {.name_space = "n", .class_name = class_name};
        EXPECT_TRUE(store.serves(catalogue, path));
        for (Operation operation : {Operation::ENUMERATE_INSTANCES, Operation::GET_INSTANCE,
                                    Operation::INVOKE_METHOD, Operation::ASSOCIATORS})
            EXPECT_EQ(CMPI_RC_ERR_ACCESS_DENIED,
                      store.run(catalogue, {.operation = operation, .path = path}).rc);
    }
    EXPECT_FALSE(store.serves(catalogue, {.name_space = "m", .class_name = "C"}));
}

TEST(Server_Store, WhatItCannotDo)
{
    Server_Store store;
    No_Catalogue catalogue;
    Request request = {
        .operation = Operation::INVOKE_METHOD, .path = {.name_space = "n", .class_name = "C"}, .method = "M"};
    EXPECT_EQ(CMPI_RC_ERR_METHOD_NOT_FOUND, store.run(catalogue, request).rc);
    request.operation = Operation::ASSOCIATORS;
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, store.run(catalogue, request).rc);
}

} // namespace
} // namespace KPRV::broker
