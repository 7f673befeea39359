#include "ufunc.hpp"

#define NPY_NO_DEPRECATED_API NPY_1_19_API_VERSION
#include <numpy/ndarrayobject.h>
#include <numpy/ufuncobject.h>

#include <algorithm>
#include <cfenv>
#include <stdexcept>
#include <thread>
#include <vector>

namespace py = pybind11;

namespace tidewater::python {

namespace {

thread_local unsigned threads_of_calls = 1;

constexpr std::size_t kGathered = 512;       // points that are brought together at a time
constexpr std::size_t kWorthAThread = 4096;  // points

// The operands of one inner loop.
struct Operands {
  char** data;
  const npy_intp* steps;
  const Kernel& kernel;
  bool words;

  TWstatus* word(std::size_t i) const {
    const int at = kernel.inputs + kernel.results;
    return reinterpret_cast<TWstatus*>(data[at] + static_cast<npy_intp>(i) * steps[at]);
  }
  template <class T>
  T* element(int operand, std::size_t i) const {
    return reinterpret_cast<T*>(data[operand] + static_cast<npy_intp>(i) * steps[operand]);
  }

  // Whether operands from first to last stand so that the kernel can work on them where they are.
  bool even(int first, int last, npy_intp size) const {
    for (int k = first; k < last; ++k) {
      if (steps[k] != steps[first]) return false;
    }
    return steps[first] == size ||
           (kernel.strided && steps[first] != 0 && steps[first] % size == 0);
  }
  // Whether a result stands in an input's place.
  bool in_place() const {
    for (int i = 0; i < kernel.inputs; ++i) {
      for (int k = 0; k < kernel.results; ++k) {
        if (data[i] == data[kernel.inputs + k]) return true;
      }
    }
    return false;
  }
};

template <class T>
void run_in_place(const Operands& o, std::size_t begin, std::size_t end) {
  const T* in[kMostInputs];
  T* out[kMostResults];
  for (int k = 0; k < o.kernel.inputs; ++k) in[k] = o.element<const T>(k, begin);
  for (int k = 0; k < o.kernel.results; ++k) out[k] = o.element<T>(o.kernel.inputs + k, begin);
  constexpr auto size = static_cast<npy_intp>(sizeof(T));
  o.kernel.run(end - begin, in, o.steps[0] / size, out, o.steps[o.kernel.inputs] / size,
               o.words ? o.word(begin) : nullptr);
}

template <class T>
void run_gathered(const Operands& o, std::size_t begin, std::size_t end) {
  T inputs[kMostInputs][kGathered];
  T results[kMostResults][kGathered];
  TWstatus words[kGathered];
  const T* in[kMostInputs];
  T* out[kMostResults];
  std::copy_n(inputs, kMostInputs, in);
  std::copy_n(results, kMostResults, out);
  for (std::size_t at = begin; at < end; at += kGathered) {
    const std::size_t count = std::min(kGathered, end - at);
    for (int k = 0; k < o.kernel.inputs; ++k) {
      for (std::size_t i = 0; i < count; ++i) inputs[k][i] = *o.element<const T>(k, at + i);
    }
    o.kernel.run(count, in, 1, out, 1, o.words ? words : nullptr);
    for (int k = 0; k < o.kernel.results; ++k) {
      for (std::size_t i = 0; i < count; ++i) {
        *o.element<T>(o.kernel.inputs + k, at + i) = results[k][i];
      }
    }
    if (!o.words) continue;
    for (std::size_t i = 0; i < count; ++i) *o.word(at + i) = words[i];
  }
}

template <class T>
void run_range(const Operands& o, std::size_t begin, std::size_t end) {
  constexpr auto size = static_cast<npy_intp>(sizeof(T));
  const int all = o.kernel.inputs + o.kernel.results;
  const bool direct = o.even(0, o.kernel.inputs, size) && o.even(o.kernel.inputs, all, size) &&
                      (!o.words || o.steps[all] == static_cast<npy_intp>(sizeof(TWstatus))) &&
                      (o.kernel.strided || !o.in_place());
  if (direct) {
    run_in_place<T>(o, begin, end);
  } else {
    run_gathered<T>(o, begin, end);
  }
}

// What numpy calls, without the interpreter's lock.
template <class T, bool kWords>
void loop(char** data, const npy_intp* dimensions, const npy_intp* steps, void* kernel) {
  const Operands operands = {data, steps, *static_cast<const Kernel*>(kernel), kWords};
  const auto count = static_cast<std::size_t>(dimensions[0]);
  std::size_t threads =
      threads_of_calls == 0 ? std::thread::hardware_concurrency() : threads_of_calls;
  threads = std::clamp<std::size_t>(count / kWorthAThread, 1, std::max<std::size_t>(threads, 1));

  const auto border = [&](std::size_t k) {
    return count / threads * k + std::min(k, count % threads);
  };
  std::vector<std::thread> workers;
  std::size_t begun = 1;
  try {
    for (; begun < threads; ++begun) {
      workers.emplace_back([&operands, first = border(begun), last = border(begun + 1)] {
        run_range<T>(operands, first, last);
      });
    }
  } catch (...) {
    // No more threads are to be had: what they would have done is done here.
  }
  run_range<T>(operands, 0, border(1));
  if (begun < threads) run_range<T>(operands, border(begun), count);
  for (std::thread& worker : workers) worker.join();
  // Points that fail are told by not-a-numbers and words, not by numpy's warnings.
  std::feclearexcept(FE_ALL_EXCEPT);
}

// All that a ufunc points at; it lives as long as the ufunc does.
struct Parts {
  std::unique_ptr<const Kernel> kernel;
  std::vector<PyUFuncGenericFunction> loops;
  std::vector<void*> data;
  std::vector<char> types;
  std::string name;
};

}  // namespace

py::object make_ufunc(std::unique_ptr<const Kernel> kernel, bool words, const char* name) {
  auto parts = std::make_unique<Parts>();
  parts->name = name;
  const auto add = [&](PyUFuncGenericFunction function, char type) {
    parts->loops.push_back(function);
    parts->data.push_back(const_cast<Kernel*>(kernel.get()));
    parts->types.insert(parts->types.end(),
                        static_cast<std::size_t>(kernel->inputs + kernel->results), type);
    if (words) parts->types.push_back(NPY_UINT32);
  };
  if (kernel->singles) add(words ? loop<float, true> : loop<float, false>, NPY_FLOAT);
  add(words ? loop<double, true> : loop<double, false>, NPY_DOUBLE);
  const int inputs = kernel->inputs;
  const int results = kernel->results + (words ? 1 : 0);
  parts->kernel = std::move(kernel);

  Parts* held = parts.get();
  py::capsule owner(parts.release(), [](void* p) { delete static_cast<Parts*>(p); });
  PyObject* ufunc =
      PyUFunc_FromFuncAndData(held->loops.data(), held->data.data(), held->types.data(),
                              static_cast<int>(held->loops.size()), inputs, results, PyUFunc_None,
                              held->name.c_str(), nullptr, 0);
  if (ufunc == nullptr) throw py::error_already_set();
  reinterpret_cast<PyUFuncObject*>(ufunc)->obj = owner.release().ptr();
  return py::reinterpret_steal<py::object>(ufunc);
}

unsigned set_threads(unsigned threads) { return std::exchange(threads_of_calls, threads); }

void import_numpy() {
  if (_import_array() < 0 || _import_umath() < 0) throw py::error_already_set();
}

}  // namespace tidewater::python
