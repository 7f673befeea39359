// Multiple-regression and complex polynomial models in the parameter store.

#include "catalogue/session.hpp"
#include "tidewater/catalogue_transform_models.h"
#include "tidewater/regression.h"

using namespace tidewater::detail;

namespace {

static_assert(sizeof(MreTerm) == 16, "a term is a packed row of a coefficient table");

constexpr const char* kRegressions = "mre models";
constexpr const char* kComplex = "Complex Models";

// A miss is written too: the number 0, or an empty text.
void name_to_number(const char* store, const char* table, const char* column, const char* name,
                    std::size_t offset, int32_t* number, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    const TWstatus found = look_up(table, column, name, TW_NO_SUCH_MODEL,
                                   [&](const Row& row) { *number = row.number<int32_t>(offset); });
    if (found == TW_NO_SUCH_MODEL) *number = 0;
    return found;
  });
}

void number_to_name(const char* store, const char* table, const char* column, int32_t number,
                    const TextField& field, char* name, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    const TWstatus found = look_up(table, column, &number, TW_NO_SUCH_MODEL,
                                   [&](const Row& row) { row.text(field, name); });
    if (found == TW_NO_SUCH_MODEL) *name = '\0';
    return found;
  });
}

// The size of the coefficient table that a text field of the row names.
template <std::size_t kSize>
TWstatus count_terms(const Row& row, const TextField& field, int32_t* count) {
  char table[kSize];
  row.text(field, table);
  return count_rows(table, Judge::kExact, TW_PF_TABLE_ERROR, count);
}

// Reads count terms.  By contract: only the store's last word is judged, so that an earlier bad row
// passes, and a table that is too short leaves the rest of the terms as they were.
TWstatus read_terms(const char* table, int32_t count, MreTerm* terms) {
  TWstoreword word = OLB7R3_PF_reset_table(table);
  if (!TW_OK(word)) return TW_PF_TABLE_ERROR;
  Row row;
  for (int32_t i = 0; i < count; ++i) {
    // Through a buffer that no row overruns; a row that is not written gives the term back.
    std::memcpy(row.data(), &terms[i], sizeof terms[i]);
    word = OLB7R3_PF_get_next_row(table, row.data());
    std::memcpy(&terms[i], row.data(), sizeof terms[i]);
  }
  return TW_OK(word) ? TW_SUCCESS : TW_PF_TABLE_ERROR;
}

}  // namespace

void TWmre_cnt(const char* store, int32_t* count, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return count_rows(kRegressions, Judge::kExact, TW_PF_TABLE_ERROR, count); });
}

void TWmre_names(const char* store, char* names, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return list_names(kRegressions, "model name", regression_row::kName, names); });
}

void TWmre_num(const char* store, const char* name, int32_t* number, TWstatus* status) {
  name_to_number(store, kRegressions, "model name", name, regression_row::kNumber, number, status);
}

void TWmre_nam(const char* store, int32_t number, char* name, TWstatus* status) {
  number_to_name(store, kRegressions, "num", number, regression_row::kName, name, status);
}

void TWmre_mdl_info(const char* store, int32_t number, void* row, int32_t* count1, int32_t* count2,
                    int32_t* count3, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    Row model;
    const TWstatus found = look_up(kRegressions, "num", &number, TW_NO_SUCH_MODEL,
                                   [&](const Row& found_row) { model = found_row; });
    if (!TW_OK(found)) return found;
    std::memcpy(row, model.data(), regression_row::kSize);
    TWstatus counted =
        count_terms<regression_row::kTable1.size>(model, regression_row::kTable1, count1);
    if (TW_OK(counted)) {
      counted = count_terms<regression_row::kTable2.size>(model, regression_row::kTable2, count2);
    }
    if (TW_OK(counted)) {
      counted = count_terms<regression_row::kTable3.size>(model, regression_row::kTable3, count3);
    }
    return counted;
  });
}

void TWmre_coef_buf(const char* store, const char* table1, const char* table2, const char* table3,
                    int32_t count1, int32_t count2, int32_t count3, MreTerm* terms1,
                    MreTerm* terms2, MreTerm* terms3, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    TWstatus read = read_terms(table1, count1, terms1);
    if (TW_OK(read)) read = read_terms(table2, count2, terms2);
    if (TW_OK(read)) read = read_terms(table3, count3, terms3);
    return read;
  });
}

void TWcpx_cnt(const char* store, int32_t* count, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return count_rows(kComplex, Judge::kExact, TW_PF_TABLE_ERROR, count); });
}

void TWcpx_names(const char* store, char* names, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return list_names(kComplex, "Model Name", complex_row::kName, names); });
}

void TWcpx_num(const char* store, const char* name, int32_t* number, TWstatus* status) {
  name_to_number(store, kComplex, "Model Name", name, complex_row::kNumber, number, status);
}

void TWcpx_nam(const char* store, int32_t number, char* name, TWstatus* status) {
  number_to_name(store, kComplex, "Number", number, complex_row::kName, name, status);
}

void TWcpx_mdl_info(const char* store, int32_t number, void* row, int32_t* count,
                    TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    Row model;
    const TWstatus found = look_up(kComplex, "Number", &number, TW_NO_SUCH_MODEL,
                                   [&](const Row& found_row) { model = found_row; });
    if (!TW_OK(found)) return found;
    std::memcpy(row, model.data(), complex_row::kSize);
    return count_terms<complex_row::kTable.size>(model, complex_row::kTable, count);
  });
}

void TWcpx_coef_buf(const char* store, const char* table, int32_t count, double* coefficients,
                    TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    if (!TW_OK(OLB7R3_PF_reset_table(table))) return TW_PF_TABLE_ERROR;
    Row row;
    for (int32_t i = 0; i < count; ++i) {
      // By contract: the word is not looked at; a table that is too short repeats its last row.
      OLB7R3_PF_get_next_row(table, row.data());
      coefficients[2 * static_cast<std::size_t>(i)] = row.number<double>(coefficient_row::kFirst);
      coefficients[2 * static_cast<std::size_t>(i) + 1] =
          row.number<double>(coefficient_row::kSecond);
    }
    return TW_SUCCESS;
  });
}
