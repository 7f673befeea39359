// Small grid files made up for the tests, byte by byte.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <functional>
#include <random>
#include <sstream>
#include <string>
#include <vector>

#include "support/data.hpp"
#include "tidewater/frame.h"

namespace tidewater::test {

inline std::string file_bytes(const std::filesystem::path& path) {
  std::ostringstream all;
  all << std::ifstream(path, std::ios::binary).rdbuf();
  return all.str();
}

inline void append_u32(std::string& bytes, std::uint32_t v) {
  for (int shift = 0; shift < 32; shift += 8) bytes += static_cast<char>(v >> shift & 0xFF);
}
inline void append_i32(std::string& bytes, std::int32_t v) {
  append_u32(bytes, static_cast<std::uint32_t>(v));
}
inline void append_f32(std::string& bytes, float v) {
  append_u32(bytes, std::bit_cast<std::uint32_t>(v));
}
inline void append_f64(std::string& bytes, double v) {
  const auto u = std::bit_cast<std::uint64_t>(v);
  append_u32(bytes, static_cast<std::uint32_t>(u));
  append_u32(bytes, static_cast<std::uint32_t>(u >> 32));
}

inline std::uint32_t u32_at(const std::string& bytes, std::size_t offset) {
  std::uint32_t v = 0;
  for (std::size_t k = 4; k-- > 0;) v = v << 8 | static_cast<unsigned char>(bytes.at(offset + k));
  return v;
}
inline std::int32_t i32_at(const std::string& bytes, std::size_t offset) {
  return static_cast<std::int32_t>(u32_at(bytes, offset));
}
inline float f32_at(const std::string& bytes, std::size_t offset) {
  return std::bit_cast<float>(u32_at(bytes, offset));
}
inline double f64_at(const std::string& bytes, std::size_t offset) {
  return std::bit_cast<double>(std::uint64_t{u32_at(bytes, offset + 4)} << 32 |
                               u32_at(bytes, offset));
}

// A control block and the word of the call that filled it.
template <class Control>
struct Opened {
  TWstatus status = 0;
  Control control = {};
};

// The control block of a directory, by the family's function for it; with a list, which is written.
template <class Control, auto function>
Opened<Control> opened_in(const ScratchFolder& folder) {
  Opened<Control> opened;
  function(folder.directory().c_str(), &opened.control, &opened.status);
  return opened;
}
template <class Control, auto function>
Opened<Control> opened_in(const ScratchFolder& folder, const std::string& list) {
  folder.write("area.par", list);
  return opened_in<Control, function>(folder);
}

// A .las, .los or .geo file.
struct GridFile {
  float xmin, ymin;
  std::int32_t nc, nr;
  std::function<float(int row, int col)> value;
  float dx = 1, dy = 1;
  std::int32_t nz = 1;
  float angle = 0;
  float label = 7777;

  // The header takes 96 bytes whatever the record's length: of fewer than 23 columns it covers the
  // first records.
  std::string bytes() const {
    std::string header(64, 'T');
    append_i32(header, nc);
    append_i32(header, nr);
    append_i32(header, nz);
    for (const float f : {xmin, dx, ymin, dy, angle}) append_f32(header, f);
    std::string all(4 * (static_cast<std::size_t>(nc) + 1), 'H');
    for (int r = 0; r < nr; ++r) {
      append_f32(all, label);
      for (int c = 0; c < nc; ++c) append_f32(all, value(r, c));
    }
    all.resize(std::max(all.size(), header.size()));
    return all.replace(0, header.size(), header);
  }
};

// A sub-grid of a .gsb file: bounds and spacing in arc-seconds, longitudes positive west.
struct SubGrid {
  std::string name, parent;
  double s_lat, n_lat, e_long, w_long, inc;
  std::function<float(int row, int col)> lat, lon;
  std::int32_t count_error = 0;
  double long_inc = 0;  // 0: as inc

  int rows() const { return static_cast<int>((n_lat - s_lat) / inc + 1.5); }
  int cols() const {
    return static_cast<int>((w_long - e_long) / (long_inc == 0 ? inc : long_inc) + 1.5);
  }
};

struct GsbFile {
  std::vector<SubGrid> grids;
  std::string from = "OLD     ", to = "NEW     ";
  std::int32_t num_orec = 11, num_srec = 11;
  std::int32_t num_file = -1;  // -1: as many as there are
  bool end_record = true;

  static std::string key(const char* name) {
    std::string k(name);
    k.resize(8, ' ');
    return k;
  }
  static void integer(std::string& all, const char* name, std::int32_t v) {
    all += key(name);
    append_i32(all, v);
    append_i32(all, 0x55555555);
  }
  static void text(std::string& all, const char* name, std::string v) {
    v.resize(8, ' ');
    all += key(name) + v;
  }
  static void real(std::string& all, const char* name, double v) {
    all += key(name);
    append_f64(all, v);
  }

  std::string bytes() const {
    std::string all;
    integer(all, "NUM_OREC", num_orec);
    integer(all, "NUM_SREC", num_srec);
    integer(all, "NUM_FILE", num_file < 0 ? static_cast<std::int32_t>(grids.size()) : num_file);
    text(all, "GS_TYPE", "SECONDS");
    text(all, "VERSION", "NTv2.0");
    text(all, "SYSTEM_F", from);
    text(all, "SYSTEM_T", to);
    for (const char* name : {"MAJOR_F", "MINOR_F", "MAJOR_T", "MINOR_T"}) real(all, name, 6378137);
    for (const SubGrid& g : grids) {
      text(all, "SUB_NAME", g.name);
      text(all, "PARENT", g.parent);
      text(all, "CREATED", "");
      text(all, "UPDATED", "");
      real(all, "S_LAT", g.s_lat);
      real(all, "N_LAT", g.n_lat);
      real(all, "E_LONG", g.e_long);
      real(all, "W_LONG", g.w_long);
      real(all, "LAT_INC", g.inc);
      real(all, "LONG_INC", g.long_inc == 0 ? g.inc : g.long_inc);
      integer(all, "GS_COUNT", g.rows() * g.cols() + g.count_error);
      for (int r = 0; r < g.rows(); ++r) {
        for (int c = 0; c < g.cols(); ++c) {
          append_f32(all, g.lat(r, c));
          append_f32(all, g.lon(r, c));
          append_f32(all, -1);
          append_f32(all, -1);
        }
      }
    }
    if (end_record) real(all, "END", 3.33e32);
    return all;
  }
};

// Points at random in a box of degrees, the same each time.
inline std::vector<CoordinateTriple> scattered(std::size_t count, double west, double east,
                                               double south, double north) {
  constexpr double kDegree = 3.14159265358979323846 / 180;
  std::mt19937 random(9);
  std::uniform_real_distribution<double> lon(west * kDegree, east * kDegree);
  std::uniform_real_distribution<double> lat(south * kDegree, north * kDegree);
  std::vector<CoordinateTriple> points(count);
  for (CoordinateTriple& p : points) p = {lon(random), lat(random), 7};
  return points;
}

// An array call of a grid function gives each point, to the last bit, what a call of its own gives
// it, and leaves the same window: that of the last load serves on, also when damage() has taken the
// files away.  reset() brings files and window back; run(n, in, out) is the call.
template <class Reset, class Run, class Damage>
void expect_one_call_as_many(const std::vector<CoordinateTriple>& in, Reset reset, Run run,
                             Damage damage) {
  constexpr CoordinateTriple kNothing = {-7e9, -7e9, -7e9};
  const auto same = [](const CoordinateTriple& a, const CoordinateTriple& b) {
    return std::memcmp(&a, &b, sizeof a) == 0;
  };
  // Near the last point: inside its window for the greater part.
  std::vector<CoordinateTriple> probes;
  for (double d = -0.02; d <= 0.02; d += 0.004) {
    probes.push_back({in.back().x + d, in.back().y + d / 2, 1});
    probes.push_back({in.back().x + d, in.back().y - d, 1});
  }
  const auto after = [&](std::vector<CoordinateTriple>* out) {
    damage();
    std::vector<TWstatus> words;
    out->assign(probes.size(), kNothing);
    for (std::size_t i = 0; i < probes.size(); ++i) words.push_back(run(1, &probes[i], &(*out)[i]));
    return words;
  };
  reset();
  std::vector<CoordinateTriple> each(in.size(), kNothing);
  TWstatus joined = TW_SUCCESS;
  for (std::size_t i = 0; i < in.size(); ++i) {
    const TWstatus word = run(1, &in[i], &each[i]);
    if (word != TW_SUCCESS) joined = word;
  }
  std::vector<CoordinateTriple> each_after;
  const std::vector<TWstatus> each_words = after(&each_after);
  reset();
  std::vector<CoordinateTriple> all(in.size(), kNothing);
  EXPECT_EQ(run(static_cast<std::int32_t>(in.size()), in.data(), all.data()), joined);
  std::vector<CoordinateTriple> all_after;
  EXPECT_EQ(after(&all_after), each_words);
  for (std::size_t i = 0; i < in.size(); ++i) EXPECT_TRUE(same(all[i], each[i])) << i;
  for (std::size_t i = 0; i < probes.size(); ++i) {
    EXPECT_TRUE(same(all_after[i], each_after[i])) << i;
  }
}

}  // namespace tidewater::test
