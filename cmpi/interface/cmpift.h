/* CMPI function tables, and the structs that point at them. */
#ifndef KLDR_CMPIFT_H
#define KLDR_CMPIFT_H

#include "cmpi_broker_tables.h"
#include "cmpi_mi_tables.h"
#include "cmpi_object_tables.h"
#include "cmpidt.h"

#endif
