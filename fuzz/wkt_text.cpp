// Any text as WKT: a definition or an error, and what is read can be written and read again.

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
    read = definition_from_wkt(text);
  } catch (const tidewater::Error& error) {
    if (error.what()[0] == '\0') std::abort();
    return 0;
  }
  for (const ParameterValue& given : read.parameters) {
    if (!std::isfinite(given.value)) std::abort();
  }
  for (const Wkt version : {Wkt::wkt1, Wkt::esri, Wkt::wkt2}) {
    try {
      definition_from_wkt(wkt_from_definition(read, version));
    } catch (const tidewater::Error&) {
      // A method or a name that the version does not have.
    }
  }
  return 0;
}
