// Names and meanings of status words, for messages.
#pragma once

#include <string>

#include "tidewater/frame.h"

namespace tidewater::command {

// The word's name, such as "TW_BAD_TEXT".
const char* status_name(TWstatus status);

// What it means to somebody who converts a line.
const char* status_meaning(TWstatus status);

// Throws std::runtime_error, with the word and what it is told of, where the status is no success.
void require(TWstatus status, const std::string& what);

}  // namespace tidewater::command
