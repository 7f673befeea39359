// Any text as a PROJ string: a definition or an error, and what is read can be written and read
// again as the same method.

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "text_forms.hpp"

using namespace tidewater::detail;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string text(reinterpret_cast<const char*>(data), size);
  Definition read;
  try {
    read = definition_from_proj(text);
  } catch (const tidewater::Error& error) {
    if (error.what()[0] == '\0') std::abort();
    return 0;
  }
  for (const ParameterValue& given : read.parameters) {
    if (!std::isfinite(given.value)) std::abort();
  }
  try {
    const std::string written = proj_from_definition(read);
    if (definition_from_proj(written).kind != read.kind) std::abort();
  } catch (const tidewater::Error&) {
    // A method that PROJ has in another form.
  }
  return 0;
}
