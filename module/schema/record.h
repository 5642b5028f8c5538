#pragma once

#include "module/runtime/Array.h"
#include "module/runtime/Datetime.h"
#include "module/runtime/Instance.h"
#include "module/runtime/Property.h"
#include "module/runtime/String.h"

// What the cells of a generated record are made of: every generated header begins here.
