// Points on their way through a chain of steps, a block at a time.
#pragma once

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>
#include <numbers>
#include <thread>
#include <utility>
#include <vector>

#include "tidewater/coordinates.hpp"
#include "tidewater/foundation.h"

namespace tidewater::detail {

// A block is as large as a fast cache likes: two arrays of 6 KB.
inline constexpr int kBlockSize = 256;

inline constexpr double kNotANumber = std::numeric_limits<double>::quiet_NaN();

struct Block {
  int count;
  CoordinateTriple* now;
  CoordinateTriple* spare;
  TWstatus* words;  // of points that have failed, TW_SUCCESS for the others
  bool failed = false;

  void swap() { std::swap(now, spare); }

  // The first word of a point stands.
  void fail(int i, TWstatus word) {
    failed = true;
    if (words[i] == TW_SUCCESS) words[i] = word;
    now[i] = {kNotANumber, kNotANumber, kNotANumber};
  }
};

// Brings an angle that is a few turns off into half a turn either way; what lies there stays as it
// is.
inline double within_half_turn(double angle) {
  constexpr double kTurn = 2 * std::numbers::pi;
  constexpr double kRound = 6755399441055744.0;  // 1.5 2^52: what is added to it is rounded
  const double turns = (angle * (1 / kTurn) + kRound) - kRound;
  return angle - turns * kTurn;
}

// One step of a chain, there and back.
class Step {
 public:
  virtual ~Step() = default;
  virtual void run(Block& block, bool inverse) const = 0;
};

// Runs range(begin, end) over an array, each range one thread's and of whole blocks.
template <class Range>
Summary run_ranges(std::size_t count, const Run& run, std::size_t block,
                   const Range& range) noexcept {
  std::size_t threads = run.threads == 0 ? std::thread::hardware_concurrency() : run.threads;
  const std::size_t worth_a_thread = 16 * block;
  threads = std::min(threads, count / worth_a_thread);
  if (threads <= 1) return range(0, count);

  std::vector<Summary> summaries;
  std::vector<std::thread> workers;
  const std::size_t blocks = (count + block - 1) / block;
  const auto border = [&](std::size_t k) { return std::min(count, blocks * k / threads * block); };
  try {
    summaries.resize(threads);
    workers.reserve(threads - 1);
    for (std::size_t k = 1; k < threads; ++k) {
      workers.emplace_back([&, k] { summaries[k] = range(border(k), border(k + 1)); });
    }
  } catch (...) {
    // No more threads are to be had: what they would have done is done here.
  }
  Summary total;
  if (summaries.empty()) return range(0, count);
  summaries[0] = range(0, border(1));
  for (std::size_t k = workers.size() + 1; k < threads; ++k) {
    summaries[k] = range(border(k), border(k + 1));
  }
  for (auto& worker : workers) worker.join();
  for (const Summary& part : summaries) {
    if (total.failed == 0) total.word = part.word;
    total.failed += part.failed;
  }
  return total;
}

// Runs a chain over an array: load(begin, block) fills block.now, store(begin, block) takes it.
template <class Load, class Chain, class Store>
Summary run_blocks(std::size_t count, const Run& run, const Load& load, const Chain& chain,
                   const Store& store) noexcept {
  const auto range = [&](std::size_t begin, std::size_t end) {
    CoordinateTriple one[kBlockSize];
    CoordinateTriple other[kBlockSize];
    TWstatus words[kBlockSize];
    std::fill_n(words, kBlockSize, TW_SUCCESS);
    Summary summary;
    for (std::size_t at = begin; at < end; at += kBlockSize) {
      Block block = {static_cast<int>(std::min<std::size_t>(kBlockSize, end - at)), one, other,
                     words};
      load(at, block);
      chain(block);
      bool odd = block.failed;
      const CoordinateTriple* const points = block.now;
      for (int i = 0; i < block.count; ++i) {
        // Nothing but a number less itself is nothing.
        odd |= !((points[i].x - points[i].x) + (points[i].y - points[i].y) == 0);
      }
      if (odd) {
        for (int i = 0; i < block.count; ++i) {
          const bool good = std::isfinite(block.now[i].x) && std::isfinite(block.now[i].y) &&
                            words[i] == TW_SUCCESS;
          if (good) continue;
          block.fail(i, TW_RANGE_ERROR);
          if (summary.failed++ == 0) summary.word = words[i];
        }
      }
      store(at, block);
      if (run.status != nullptr) std::copy_n(words, block.count, run.status + at);
      if (odd) std::fill_n(words, kBlockSize, TW_SUCCESS);
    }
    return summary;
  };
  return run_ranges(count, run, kBlockSize, range);
}

}  // namespace tidewater::detail
