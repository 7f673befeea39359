// The seven store operations on a store file, with a current store for each thread.

#include <limits>
#include <map>
#include <memory>
#include <string>

#include "table_store.hpp"
#include "tidewater/store.h"

namespace {

constexpr TWstoreword kFailure = UINT32_C(0x09608012);
constexpr TWstoreword kNoSuchRow = UINT32_C(0x09608022);

struct Session {
  explicit Session(const char* path) : store(path) {}
  tabdll::TableStore store;
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
  session.walks.insert_or_assign(table, session.store.walk(table, column));
}

}  // namespace

TWstoreword OLB7R3_PF_open(const char* path) {
  current.reset();
  return answer([&] {
    current = std::make_unique<Session>(path);
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
    return walk->second.next(row) ? TW_STORE_SUCCESS : TW_STORE_END_OF_TABLE;
  });
}

TWstoreword OLB7R3_PF_get_row_by_value(const char* table, int32_t /*mode*/, const char* column,
                                       const void* key, void* row) {
  return on_current([&](Session& session) {
    return session.store.find(table, column, key, row) ? TW_STORE_SUCCESS : kNoSuchRow;
  });
}

TWstoreword OLB7R3_PF_inq_num_rows(const char* table, int32_t* count) {
  return on_current([&](Session& session) {
    const int64_t rows = session.store.count_rows(table);
    if (rows > std::numeric_limits<int32_t>::max()) return kFailure;
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
