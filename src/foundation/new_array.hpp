// Arrays for which there may be no memory.
#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>
#include <new>

namespace tidewater::detail {

// An array, or null where there is no memory for it.  Alone std::nothrow does throw where the bytes
// are more than a pointer counts, as those of 2^31 points are on 32 bits.
template <class T>
std::unique_ptr<T[]> new_array(std::uint64_t count) {
  constexpr std::uint64_t kMost = std::numeric_limits<std::ptrdiff_t>::max() / sizeof(T);
  if (count > kMost) return nullptr;
  return std::unique_ptr<T[]>(new (std::nothrow) T[static_cast<std::size_t>(count)]);
}

}  // namespace tidewater::detail
