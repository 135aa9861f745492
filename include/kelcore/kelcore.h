// kelcore: every public header in one include.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/Base64.h>
#include <kelcore/utility/SmallBlockAllocator.h>
#include <kelcore/utility/StringTypes.h>
#include <kelcore/utility/UnicodeConversion.h>
