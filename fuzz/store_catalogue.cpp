// Bytes as a store file on disk, read by the library: every list fits the area that its count asks
// for, every model the arrays that its epochs ask for.

#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "tidewater/catalogue.h"

namespace {

// A file of this process alone.
class Scratch {
 public:
  Scratch()
      : path_(std::filesystem::temp_directory_path() /
              ("tidewater-fuzz-" + std::to_string(::getpid()) + ".store")) {}
  ~Scratch() {
    std::error_code ignored;
    std::filesystem::remove(path_, ignored);
  }
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;

  std::string path() const { return path_.string(); }
  void write(const std::uint8_t* data, std::size_t size) const {
    std::ofstream(path_, std::ios::binary)
        .write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
  }

 private:
  std::filesystem::path path_;
};

using Count = void (*)(const char*, int32_t*, TWstatus*);
using List = void (*)(const char*, char*, TWstatus*);

// The names of a list, 41 bytes apart.
std::vector<char> names_of(const char* store, Count count, List list) {
  int32_t rows = 0;
  TWstatus status = 0;
  count(store, &rows, &status);
  if (!TW_OK(status)) return {};
  std::vector<char> names(static_cast<std::size_t>(rows) * 41);
  list(store, names.data(), &status);
  if (!TW_OK(status)) names.clear();
  return names;
}

void read_magnetic_model(const char* store, char* name) {
  std::vector<char> table(28), text(30);
  int16_t number = 0, normalisation = 0;
  double radius = 0, lower = 0, upper = 0, interval = 0;
  int32_t epoch_count = 0;
  TWstatus status = 0;
  TWmagmdl_info(store, name, &number, 1, table.data(), &radius, &normalisation, text.data(), &lower,
                &upper, &interval, &epoch_count, &status);
  if (!TW_OK(status) || number == 0) return;
  const auto k = static_cast<std::size_t>(epoch_count);
  std::vector<int32_t> degrees(k);
  std::vector<double> dates(k);
  std::vector<char> tables(k * 33);
  TWepoch_info(store, table.data(), degrees.data(), dates.data(), tables.data(), &status);
  if (!TW_OK(status)) return;
  std::vector<std::vector<double>> blocks;
  std::vector<std::vector<double*>> rows;
  std::vector<double**> c_sets, s_sets;
  blocks.reserve(2 * k);
  rows.reserve(2 * k);
  for (const int32_t degree : degrees) {
    const auto size = static_cast<std::size_t>(degree) + 1;
    for (auto* sets : {&c_sets, &s_sets}) {
      auto& block = blocks.emplace_back(size * (size + 1) / 2);
      auto& table_rows = rows.emplace_back();
      for (std::size_t n = 0; n < size; ++n) table_rows.push_back(&block[n * (n + 1) / 2]);
      sets->push_back(table_rows.data());
    }
  }
  TWmm_coef_info(store, epoch_count, degrees.data(), tables.data(), c_sets.data(), s_sets.data(),
                 &status);
}

void read_regression(const char* store, int32_t number) {
  std::vector<char> row(144);
  int32_t counts[3] = {};
  TWstatus status = 0;
  TWmre_mdl_info(store, number, row.data(), &counts[0], &counts[1], &counts[2], &status);
  if (!TW_OK(status)) return;
  std::vector<MreTerm> terms[3];
  for (int i = 0; i < 3; ++i) terms[i].resize(static_cast<std::size_t>(counts[i]));
  TWmre_coef_buf(store, &row[74], &row[95], &row[116], counts[0], counts[1], counts[2],
                 terms[0].data(), terms[1].data(), terms[2].data(), &status);
}

void read_complex(const char* store, int32_t number) {
  std::vector<char> row(112);
  int32_t count = 0;
  TWstatus status = 0;
  TWcpx_mdl_info(store, number, row.data(), &count, &status);
  if (!TW_OK(status)) return;
  std::vector<double> coefficients(2 * static_cast<std::size_t>(count));
  TWcpx_coef_buf(store, &row[88], count, coefficients.data(), &status);
}

void read_records(const char* store) {
  int32_t count = 0;
  TWstatus status = 0;
  for (const int16_t kind : {int16_t{0}, int16_t{83}}) {
    TWspcs_cnt(store, kind, &count, &status);
    if (!TW_OK(status)) continue;
    std::vector<ZoneRecord> zones(static_cast<std::size_t>(count));
    TWspcs_get_all(store, kind, zones.data(), &status);
  }
  TWsomps_cnt(store, &count, &status);
  if (!TW_OK(status)) return;
  std::vector<SatelliteRecord> satellites(static_cast<std::size_t>(count));
  TWsomps_get_all(store, satellites.data(), &status);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const Scratch scratch;
  scratch.write(data, size);
  const std::string path = scratch.path();
  const char* store = path.c_str();

  std::vector<char> systems = names_of(
      store, [](const char* s, int32_t* n, TWstatus* w) { TWget_cs_cnt(s, -1, n, w); },
      [](const char* s, char* names, TWstatus* w) { TWget_cs_names(s, -1, names, w); });
  for (std::size_t i = 0; i < systems.size(); i += 41) {
    int16_t number = 0;
    char text[41];
    TWstatus status = 0;
    TWcs_to_num(store, &systems[i], &number, &status);
    TWnum_to_cs(store, number, text, &status);
    TWcs_to_class(store, &systems[i], text, &status);
  }
  names_of(store, TWget_vd_cnt, TWget_vd_names);
  names_of(store, TWget_undl_cnt, TWget_undl_nam);
  names_of(store, TWmre_cnt, TWmre_names);
  names_of(store, TWcpx_cnt, TWcpx_names);
  std::vector<char> models = names_of(store, TWmag_mdl_cnt, TWmagmdl_names);
  for (std::size_t i = 0; i < models.size(); i += 41) {
    char name[42] = "";
    std::string(&models[i]).copy(name, 41);
    read_magnetic_model(store, name);
  }
  for (int32_t number = 1; number <= 3; ++number) {
    read_regression(store, number);
    read_complex(store, number);
  }
  read_records(store);
  return 0;
}
