#pragma once

#include "runtime/Array.h"
#include "runtime/Datetime.h"
#include "runtime/Instance.h"
#include "runtime/Property.h"
#include "runtime/String.h"

// What the cells of a generated record are made of: every generated header begins here.
