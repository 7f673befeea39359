// The digests use headers of the tests, and none of their expectations.
#pragma once

#define EXPECT_EQ(a, b) static_cast<void>((a) == (b))
#define EXPECT_NEAR(a, b, tolerance) static_cast<void>((a) - (b) <= (tolerance))
