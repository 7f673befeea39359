#include "store_path.hpp"

#include <cstdlib>
#include <filesystem>
#include <vector>

#ifdef _WIN32
#include <windows.h>
#else
#include <dlfcn.h>
#endif

#include "tidewater/error.hpp"

namespace fs = std::filesystem;

namespace tidewater::detail {

namespace {

// The file that this code was loaded from: the library, or a program with the library in it.
fs::path module_path() {
#ifdef _WIN32
  HMODULE module = nullptr;
  wchar_t name[32768];
  if (!GetModuleHandleExW(
          GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
          reinterpret_cast<LPCWSTR>(&module_path), &module)) {
    return {};
  }
  const DWORD size = GetModuleFileNameW(module, name, 32768);
  return size < 32768 ? fs::path(name, name + size) : fs::path();
#else
  Dl_info info = {};
  if (dladdr(reinterpret_cast<const void*>(&module_path), &info) == 0) return {};
  fs::path path = info.dli_fname;
  std::error_code error;
  // A program found by its bare name does not know its folder.
  if (!path.has_parent_path()) path = fs::read_symlink("/proc/self/exe", error);
  return fs::weakly_canonical(path, error);
#endif
}

}  // namespace

std::string store_path() {
  if (const char* named = std::getenv("TIDEWATER_STORE"); named && *named) return named;
  const fs::path folder = module_path().parent_path();
  const std::vector<fs::path> places = {
      folder / TIDEWATER_STORE_FROM_LIBRARY,          // an installed library
      folder / "../share/tidewater/tidewater.store",  // an installed program
      folder / "tidewater.store",                     // a bundle
      folder / "../tidewater.store"};                 // a build tree
  std::string tried;
  for (const fs::path& place : places) {
    const fs::path path = place.lexically_normal();
    std::error_code error;
    if (fs::is_regular_file(path, error)) return path.string();
    tried += (tried.empty() ? "\"" : ", \"") + path.string() + "\"";
  }
  throw Error("No parameter store was found at " + tried +
              "; the environment variable TIDEWATER_STORE may name one.");
}

}  // namespace tidewater::detail
