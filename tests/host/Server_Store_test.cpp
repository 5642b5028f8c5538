#include "host/Server_Store.h"

#include "host/Class_Catalogue.h"

#include <gtest/gtest.h>

namespace KPRV::host {
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
} // namespace KPRV::host
