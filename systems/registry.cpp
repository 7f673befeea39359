#include "registry.hpp"
