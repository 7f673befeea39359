// Names and meanings of status words, for messages.
#pragma once

#include <string>

#include "tidewater/frame.h"

namespace tidewater::command {

// The word's name, such as "TW_BAD_TEXT".
const char* status_name(TWstatus status);

// What it means to somebody who converts a line.
const char* status_meaning(TWstatus status);

// Beyond a grid, rather than wrong.
inline bool is_outside(TWstatus status) {
  return status == TW_I_OUTSIDE_NADCON || status == TW_I_OUTSIDE_GEOID ||
         status == TW_I_OUTSIDE_CNT;
}

// Throws std::runtime_error, with the word and what it is told of, where the status is no success.
void require(TWstatus status, const std::string& what);

}  // namespace tidewater::command
