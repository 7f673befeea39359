// Who wants to know of each call of the library that the array functions target makes: the test of
// what allocates.
#pragma once

// Called before (begins) and behind each call; null where nobody asks.
extern void (*on_call)(const char* function, bool begins);
