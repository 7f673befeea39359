// Geomagnetic models in the parameter store: the models, their epochs and their coefficients.

#include "catalogue/session.hpp"
#include "tidewater/catalogue_magnetic_models.h"

using namespace tidewater::detail;

namespace {

constexpr const char* kTable = "magnetic models";

// Names of coefficient tables stand as far apart as they are long in an epoch row.
constexpr std::size_t kTableSlot = epoch_row::kTable.size;

// Checks and writes the fields of a model in order: what stands behind the first bad one stays
// unwritten.  The comparisons are turned so that a not-a-number is bad.
TWstatus read_model(const Row& row, char* epoch_table, double* model_constant_1,
                    int16_t* normalisation, char* model_text, double* lower_bound,
                    double* upper_bound, double* model_constant_2, int32_t* epoch_count) {
  row.text(magnetic_row::kEpochTable, epoch_table);
  row.text(magnetic_row::kText, model_text);
  const auto constant_1 = row.number<double>(magnetic_row::kConstant1);
  if (!(constant_1 > 0)) return TW_BAD_DATA;
  *model_constant_1 = constant_1;
  const auto kind = row.number<int16_t>(magnetic_row::kNormalisation);
  if (kind < 0 || kind > 3) return TW_BAD_HARMONIC_MODEL;
  *normalisation = kind;
  const auto lower = row.number<double>(magnetic_row::kLowerBound);
  const auto upper = row.number<double>(magnetic_row::kUpperBound);
  if (!(lower >= 0 && lower <= upper)) return TW_BAD_DATA;
  *lower_bound = lower;
  if (!(upper > 0)) return TW_BAD_DATA;
  *upper_bound = upper;
  const auto constant_2 = row.number<double>(magnetic_row::kConstant2);
  if (!(constant_2 >= 0)) return TW_BAD_DATA;
  *model_constant_2 = constant_2;
  return count_rows(epoch_table, Judge::kLowBit, TW_BAD_DATA, epoch_count);
}

// One walk of an epoch table, up to its end or to the first row that cannot be.
TWstatus read_epochs(const char* epoch_table, int32_t* degrees, double* epochs, char* table_names) {
  Row row;
  double last = 0;
  for (std::size_t i = 0; OLB7R3_PF_get_next_row(epoch_table, row.data()) != TW_STORE_END_OF_TABLE;
       ++i) {
    const auto date = row.number<double>(epoch_row::kDate);
    if (i > 0 && !(date > last)) return TW_BAD_DATA;
    epochs[i] = last = date;
    const auto degree = row.number<int16_t>(epoch_row::kDegree);
    if (degree <= 0) return TW_BAD_DATA;
    degrees[i] = degree;
    row.text(epoch_row::kTable, table_names + i * kTableSlot);
  }
  return TW_SUCCESS;
}

}  // namespace

void TWmag_mdl_cnt(const char* store, int32_t* count, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return count_rows(kTable, Judge::kLowBit, TW_FAILURE, count); });
}

void TWmagmdl_names(const char* store, char* names, TWstatus* status) {
  // By contract: the word of a failed search is another one than in all other lists.
  in_store(store, Close::kIgnored, status, [&] {
    return list_names(kTable, "model name", magnetic_row::kName, names, TW_FAILURE);
  });
}

void TWmm_nam_t_num(const char* store, const char* name, int16_t* number, TWstatus* status) {
  in_store(store, Close::kTested, status, [&] {
    return look_up(kTable, "model name", name, TW_NO_SUCH_MODEL,
                   [&](const Row& row) { *number = row.number<int16_t>(magnetic_row::kNumber); });
  });
}

void TWmm_num_t_nam(const char* store, int16_t number, char* name, TWstatus* status) {
  in_store(store, Close::kTested, status, [&] {
    return look_up(kTable, "model number", &number, TW_NO_SUCH_MODEL,
                   [&](const Row& row) { row.text(magnetic_row::kName, name); });
  });
}

void TWmagmdl_info(const char* store, char* name, int16_t* number, int16_t by_name,
                   char* epoch_table, double* model_constant_1, int16_t* normalisation,
                   char* model_text, double* lower_bound, double* upper_bound,
                   double* model_constant_2, int32_t* epoch_count, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    const char* column = by_name != 0 ? "model name" : "model number";
    const void* key = by_name != 0 ? static_cast<const void*>(name) : number;
    Row model;
    const TWstatus found =
        look_up(kTable, column, key, TW_NO_SUCH_MODEL, [&](const Row& row) { model = row; });
    if (!TW_OK(found)) return found;
    const auto model_number = model.number<int16_t>(magnetic_row::kNumber);
    if (by_name != 0) {
      *number = model_number;
    } else {
      model.text(magnetic_row::kName, name);
    }
    if (model_number == 0) return TW_SUCCESS;  // only name and number mean anything
    return read_model(model, epoch_table, model_constant_1, normalisation, model_text, lower_bound,
                      upper_bound, model_constant_2, epoch_count);
  });
}

void TWepoch_info(const char* store, const char* epoch_table, int32_t* degrees, double* epochs,
                  char* table_names, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    const TWstatus begun = begin_walk(epoch_table, "Epoch date");
    if (!TW_OK(begun)) return begun;
    return read_epochs(epoch_table, degrees, epochs, table_names);
  });
}

void TWmm_coef_info(const char* store, int32_t k, const int32_t* degrees, const char* table_names,
                    double*** C, double*** S, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    Row row;
    for (int32_t i = 0; i < k; ++i) {
      char table[kTableSlot];
      copy_field(table_names + static_cast<std::size_t>(i) * kTableSlot, kTableSlot, table);
      const TWstatus begun = begin_walk(table, nullptr);
      if (!TW_OK(begun)) return begun;
      for (int32_t n = 0; n <= degrees[i]; ++n) {
        for (int32_t m = 0; m <= n; ++m) {
          // By contract: the end-of-table word passes, a table that is too short repeats its last
          // row.
          if (!TW_OK(OLB7R3_PF_get_next_row(table, row.data()))) return TW_BAD_DATA;
          C[i][n][m] = row.number<double>(coefficient_row::kFirst);
          S[i][n][m] = row.number<double>(coefficient_row::kSecond);
        }
      }
    }
    return TW_SUCCESS;
  });
}
