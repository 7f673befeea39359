// Text as a string of JSON.
#pragma once

#include <string>
#include <string_view>

namespace tidewater::command {

// Writes text behind json, quoted (RFC 8259).  What is no UTF-8 becomes U+FFFD, a byte at a time.
void append_json_string(std::string& json, std::string_view text);

}  // namespace tidewater::command
