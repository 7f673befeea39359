// The seven store operations on a store file, with a current store for each thread.

#include <cstring>
#include <map>
#include <memory>
#include <string>
#include <utility>

#include "store_cache.hpp"
#include "tidewater/store.h"

namespace {

constexpr TWstoreword kFailure = UINT32_C(0x09608012);
constexpr TWstoreword kNoSuchRow = UINT32_C(0x09608022);

struct Session {
  std::shared_ptr<const tabdll::TableStore> store;
  std::map<std::string, tabdll::Walk, std::less<>> walks;
};

thread_local std::unique_ptr<Session> current;

// Runs an operation; whatever it throws becomes the failure word.
template <class Operation>
TWstoreword answer(Operation operation) noexcept {
  try {
    return operation();
  } catch (...) {
    return kFailure;
  }
}

// The same, for an operation on the current store.
template <class Operation>
TWstoreword on_current(Operation operation) noexcept {
  if (!current) return kFailure;
  return answer([&] { return operation(*current); });
}

void begin_walk(Session& session, const char* table, const char* column) {
  session.walks.insert_or_assign(table, tabdll::Walk(session.store->table(table), column));
}

void copy_row(const tabdll::Table& table, const char* row, void* out) {
  std::memcpy(out, row, table.layout().row_size());
}

}  // namespace

TWstoreword OLB7R3_PF_open(const char* path) {
  current.reset();
  return answer([&] {
    current = std::make_unique<Session>(Session{tabdll::open_store(path), {}});
    return TW_STORE_SUCCESS;
  });
}

TWstoreword OLB7R3_PF_reset_table(const char* table) {
  return on_current([&](Session& session) {
    begin_walk(session, table, nullptr);
    return TW_STORE_SUCCESS;
  });
}

TWstoreword OLB7R3_PF_define_table_search(const char* table, const char* column) {
  return on_current([&](Session& session) {
    begin_walk(session, table, column);
    return TW_STORE_SUCCESS;
  });
}

TWstoreword OLB7R3_PF_get_next_row(const char* table, void* row) {
  return on_current([&](Session& session) {
    const auto walk = session.walks.find(table);
    if (walk == session.walks.end()) return kFailure;
    const char* next = walk->second.next();
    if (!next) return TW_STORE_END_OF_TABLE;
    copy_row(walk->second.table(), next, row);
    return TW_STORE_SUCCESS;
  });
}

TWstoreword OLB7R3_PF_get_row_by_value(const char* table, int32_t /*mode*/, const char* column,
                                       const void* key, void* row) {
  return on_current([&](Session& session) {
    const tabdll::Table& rows = session.store->table(table);
    const char* found = rows.find(column, key);
    if (!found) return kNoSuchRow;
    copy_row(rows, found, row);
    return TW_STORE_SUCCESS;
  });
}

TWstoreword OLB7R3_PF_inq_num_rows(const char* table, int32_t* count) {
  return on_current([&](Session& session) {
    const std::size_t rows = session.store->table(table).size();
    if (!std::in_range<int32_t>(rows)) return kFailure;
    *count = static_cast<int32_t>(rows);
    return TW_STORE_SUCCESS;
  });
}

TWstoreword OLB7R3_PF_close(int32_t /*mode*/) {
  return on_current([&](Session&) {
    current.reset();
    return TW_STORE_SUCCESS;
  });
}
