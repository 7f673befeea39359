// The store of the WebAssembly library: the packed tables that the page or program hands over.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <exception>
#include <span>

#include "packed_tables.hpp"
#include "store_cache.hpp"
#include "store_error.hpp"

namespace tabdll {

namespace {

std::shared_ptr<const TableStore>& the_store() {
  static std::shared_ptr<const TableStore> store;
  return store;
}

}  // namespace

// There is one store, whatever its path.
std::shared_ptr<const TableStore> open_store(const char* /*path*/) {
  if (!the_store()) throw StoreError("no tables were handed over");
  return the_store();
}

}  // namespace tabdll

// Takes the tables, once and before all else; 1, or 0 for bytes that are no packed tables.
extern "C" std::int32_t tidewater_open(const unsigned char* bytes, std::size_t size) {
  try {
    tabdll::the_store() =
        std::make_shared<const tabdll::TableStore>(tabdll::unpack_tables(std::span(bytes, size)));
    return setenv("TIDEWATER_STORE", "packed", 1) == 0 ? 1 : 0;
  } catch (const std::exception&) {
    return 0;
  }
}
