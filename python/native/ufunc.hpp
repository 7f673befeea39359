// Calls on arrays as real numpy ufuncs.
#pragma once

#include <pybind11/pybind11.h>

#include <cstddef>
#include <memory>

#include "tidewater/frame.h"

namespace tidewater::python {

// A call of so many inputs and results a point.  A stride, in elements, is that of all inputs or of
// all results.  Words may be null.
class Kernel {
 public:
  Kernel(int input_count, int result_count) : inputs(input_count), results(result_count) {}
  virtual ~Kernel() = default;

  virtual void run(std::size_t count, const double* const* in, std::ptrdiff_t in_stride,
                   double* const* out, std::ptrdiff_t out_stride, TWstatus* words) const = 0;
  // Only for those that serve single precision.
  virtual void run(std::size_t, const float* const*, std::ptrdiff_t, float* const*, std::ptrdiff_t,
                   TWstatus*) const {}

  const int inputs;
  const int results;
  bool singles = false;  // has a form for float
  bool strided = false;  // takes strides other than one, and results in the inputs' place
};

inline constexpr int kMostInputs = 4;
inline constexpr int kMostResults = 7;

// A numpy ufunc that owns the kernel.  With words it has one result more, of unsigned 32-bit words.
pybind11::object make_ufunc(std::unique_ptr<const Kernel> kernel, bool words, const char* name);

// How many threads the calls of this thread may take; gives what held before.  0: all cores.
unsigned set_threads(unsigned threads);

// To be called once, when the module is loaded.
void import_numpy();

}  // namespace tidewater::python
