/* CMPI function tables, and the structs that point at them. */
#ifndef KLDR_CMPIFT_H
#define KLDR_CMPIFT_H

#include "contracts/cmpi/cmpi_broker_tables.h"
#include "contracts/cmpi/cmpi_mi_tables.h"
#include "contracts/cmpi/cmpi_object_tables.h"
#include "contracts/cmpi/cmpidt.h"

#endif
