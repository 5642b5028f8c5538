#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/Property.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"

// What the cells of a generated record are made of: every generated header begins here.
