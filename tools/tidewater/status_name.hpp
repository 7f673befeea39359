// Names and meanings of status words, for messages.
#pragma once

#include "tidewater/frame.h"

namespace tidewater::command {

// The word's name, such as "TW_BAD_TEXT".
const char* status_name(TWstatus status);

// What it means to somebody who converts a line.
const char* status_meaning(TWstatus status);

}  // namespace tidewater::command
