// The wrap about a central meridian has moved to the other wraps.
#pragma once

#include "formulas/wraps.hpp"
