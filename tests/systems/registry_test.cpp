#include "registry.hpp"

#include <gtest/gtest.h>
