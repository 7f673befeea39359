#include "builder.hpp"

#include <fcntl.h>
#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <cmath>
#include <cstring>
#include <map>
#include <memory>
#include <new>
#include <random>
#include <utility>

#include "csv.hpp"
#include "database.hpp"
#include "layout.hpp"
#include "table_store.hpp"

namespace fs = std::filesystem;

namespace tabdll {

namespace {

using Layouts = std::map<std::string, Layout>;

// The number that a cell is, all of it.
template <class Number>
Number parse(const CsvFile& file, const CsvRecord& record, std::size_t column,
             const char* expected) {
  const std::string& cell = record.cells[column];
  Number value = 0;
  const auto [end, error] = std::from_chars(cell.data(), cell.data() + cell.size(), value);
  if (error != std::errc() || end != cell.data() + cell.size()) {
    throw SourceError(
        file.path, record.line,
        "column " + file.header.cells[column] + ": \"" + cell + "\" is no " + expected);
  }
  return value;
}

void require_sound(const fs::path& path, const std::string& name, const Layout& layout) {
  const std::string fault = fault_of(layout);
  if (!fault.empty()) throw SourceError(path.string() + ": layout " + name + ": " + fault);
}

Layouts read_layouts(const fs::path& path) {
  const CsvFile file = read_csv(path);
  const std::size_t name = file.column("layout");
  const std::size_t column = file.column("column");
  const std::size_t type = file.column("type");
  const std::size_t offset = file.column("offset");
  const std::size_t size = file.column("size");
  Layouts layouts;
  for (const CsvRecord& r : file.records) {
    const auto field = field_type(r.cells[type]);
    if (!field) {
      throw SourceError(
          path, r.line,
          "column type: \"" + r.cells[type] + "\" is none of text, int16, int32, float64, pad");
    }
    Layout& layout = layouts[r.cells[name]];
    layout.fields.push_back({r.cells[column], *field,
                             parse<int64_t>(file, r, offset, "whole number"),
                             parse<int64_t>(file, r, size, "whole number")});
    // A pad alone is no layout yet, a column is to follow.
    const std::string fault = fault_of(layout);
    if (!fault.empty() && *field != FieldType::kPad) {
      throw SourceError(path, r.line, "layout " + r.cells[name] + ": " + fault);
    }
  }
  for (const auto& [layout_name, layout] : layouts) require_sound(path, layout_name, layout);
  return layouts;
}

std::string_view sql_type(FieldType type) {
  switch (type) {
    case FieldType::kText:
      return "TEXT";
    case FieldType::kFloat64:
      return "REAL";
    default:
      return "INTEGER";
  }
}

template <class Number>
void bind_integer(Statement& s, int parameter, const CsvFile& file, const CsvRecord& r,
                  std::size_t column) {
  s.bind(parameter,
         int64_t{parse<Number>(file, r, column,
                               sizeof(Number) == 2 ? "16-bit integer" : "32-bit integer")});
}

void bind_cell(Statement& s, int parameter, const Field& field, const CsvFile& file,
               const CsvRecord& r, std::size_t column) {
  const std::string& cell = r.cells[column];
  switch (field.type) {
    case FieldType::kText:
      if (cell.size() >= static_cast<std::size_t>(field.size)) {
        throw SourceError(file.path, r.line,
                          "column " + field.column + ": a text of " + std::to_string(cell.size()) +
                              " bytes, the field holds " + std::to_string(field.size - 1));
      }
      if (cell.find('\0') != std::string::npos) {
        throw SourceError(file.path, r.line, "column " + field.column + ": a zero byte in a text");
      }
      return s.bind(parameter, cell);
    case FieldType::kInt16:
      return bind_integer<int16_t>(s, parameter, file, r, column);
    case FieldType::kInt32:
      return bind_integer<int32_t>(s, parameter, file, r, column);
    case FieldType::kFloat64: {
      const auto value = parse<double>(file, r, column, "number");
      if (!std::isfinite(value)) {
        throw SourceError(file.path, r.line, "column " + field.column + ": not finite");
      }
      return s.bind(parameter, value);
    }
    case FieldType::kPad:
      return;  // no column
  }
}

struct FreeBytes {
  void operator()(unsigned char* bytes) const { sqlite3_free(bytes); }
};
struct Bytes {
  std::unique_ptr<unsigned char, FreeBytes> data;
  std::size_t size;
};

class Builder {
 public:
  Builder() : database_(open_in_memory()) {
    run("BEGIN");
    run("CREATE TABLE " + identifier(kLayoutTable) +
        " (\"table\" TEXT NOT NULL, \"column\" TEXT NOT NULL, \"type\" TEXT NOT NULL, "
        "\"offset\" INTEGER NOT NULL, \"size\" INTEGER NOT NULL)");
  }

  void add(const std::string& table, const Layout& layout, const CsvFile& file) {
    add_layout(table, layout);
    std::string columns;
    std::string parameters;
    std::vector<std::pair<const Field*, std::size_t>> cells;
    for (const Field& f : layout.fields) {
      if (f.type == FieldType::kPad) continue;
      columns += (cells.empty() ? "" : ", ") + identifier(f.column) + " " +
                 std::string(sql_type(f.type)) + " NOT NULL";
      parameters += cells.empty() ? "?" : ", ?";
      cells.emplace_back(&f, file.column(f.column));
    }
    if (file.header.cells.size() != cells.size()) {
      throw SourceError(file.path, file.header.line, "columns that the layout does not have");
    }
    run("CREATE TABLE " + identifier(table) + " (" + columns + ")");
    Statement insert(database_.get(),
                     "INSERT INTO " + identifier(table) + " VALUES (" + parameters + ")");
    for (const CsvRecord& r : file.records) {
      int parameter = 0;
      for (const auto& [field, column] : cells) {
        bind_cell(insert, ++parameter, *field, file, r, column);
      }
      insert.step();
      insert.reset();
    }
  }

  // The bytes of the store's file.
  Bytes finish() {
    run("COMMIT");
    sqlite3_int64 size = 0;
    unsigned char* bytes = sqlite3_serialize(database_.get(), "main", &size, 0);
    if (!bytes) throw std::bad_alloc();
    return {std::unique_ptr<unsigned char, FreeBytes>(bytes), static_cast<std::size_t>(size)};
  }

 private:
  void run(const std::string& sql) { tabdll::run(database_.get(), sql); }

  void add_layout(const std::string& table, const Layout& layout) {
    Statement insert(database_.get(),
                     "INSERT INTO " + identifier(kLayoutTable) + " VALUES (?, ?, ?, ?, ?)");
    for (const Field& f : layout.fields) {
      insert.bind(1, table);
      insert.bind(2, f.column);
      insert.bind(3, type_name(f.type));
      insert.bind(4, f.offset);
      insert.bind(5, f.size);
      insert.step();
      insert.reset();
    }
  }

  Database database_;
};

[[noreturn]] void refuse(const fs::path& path, const std::string& what) {
  throw SourceError(path.string() + ": " + what);
}

// The file that a store's path stands for.  A link is followed, so that it stays what it is; what
// is there and is no file, or must not be written, is refused.
fs::path target_of(const fs::path& store) {
  std::error_code error;
  fs::path target = store;
  if (fs::is_symlink(fs::symlink_status(store, error))) {
    target = fs::canonical(store, error);
    if (error) refuse(store, "a link to nothing");
  }
  const fs::file_status status = fs::status(target, error);
  if (!fs::exists(status)) return target;
  if (!fs::is_regular_file(status)) refuse(store, "there, and no regular file");
  if (::access(target.c_str(), W_OK) != 0) refuse(store, "cannot be written");
  return target;
}

// While it lives, the signals that ask a command to end wait: a draft is removed or in its place
// before they do.
class SignalsHeld {
 public:
  SignalsHeld() {
    sigset_t ends;
    ::sigemptyset(&ends);
    for (const int signal : {SIGHUP, SIGINT, SIGTERM}) ::sigaddset(&ends, signal);
    ::pthread_sigmask(SIG_BLOCK, &ends, &before_);
  }
  ~SignalsHeld() { ::pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
  SignalsHeld(const SignalsHeld&) = delete;
  SignalsHeld& operator=(const SignalsHeld&) = delete;

 private:
  sigset_t before_;
};

// A new file beside its target, under a name that nothing else has, that takes the target's place
// when it is whole.  Until then the target is as it was, and a failure removes this file alone.
class Draft {
 public:
  explicit Draft(const fs::path& target) : target_(target) {
    std::random_device random;
    for (int attempt = 0; attempt < 100 && file_ < 0; ++attempt) {
      path_ = target.parent_path() /
              ("." + target.filename().string() + "." + std::to_string(random()));
      file_ = ::open(path_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC | O_NOFOLLOW, 0666);
      if (file_ < 0 && errno != EEXIST) break;
    }
    if (file_ < 0) refuse(target, std::string("cannot be written: ") + std::strerror(errno));
  }
  ~Draft() {
    if (file_ >= 0) ::close(file_);
    if (!in_place_) ::unlink(path_.c_str());
  }
  Draft(const Draft&) = delete;
  Draft& operator=(const Draft&) = delete;

  void write(const Bytes& bytes) {
    keep_permissions();
    for (std::size_t done = 0; done < bytes.size;) {
      const ssize_t n = ::write(file_, bytes.data.get() + done, bytes.size - done);
      if (n < 0 && errno == EINTR) continue;
      require(n > 0);
      done += static_cast<std::size_t>(n);
    }
    require(::fsync(file_) == 0);
    const int file = std::exchange(file_, -1);
    require(::close(file) == 0);
  }

  void put_in_place() {
    require(::rename(path_.c_str(), target_.c_str()) == 0);
    in_place_ = true;
  }

 private:
  void require(bool worked) const {
    if (!worked) refuse(target_, std::string("cannot be written: ") + std::strerror(errno));
  }

  // Those of the file that is replaced, before there is anything to read.  Its owner and group too,
  // where we may give files away; where not, the group has no more rights than all others.
  void keep_permissions() const {
    struct stat old;
    if (::stat(target_.c_str(), &old) != 0) return;
    mode_t mode = old.st_mode & 0777;
    if (::fchown(file_, old.st_uid, old.st_gid) != 0 &&
        ::fchown(file_, uid_t(-1), old.st_gid) != 0) {
      mode &= ~mode_t{070} | ((mode & 07) << 3);
    }
    require(::fchmod(file_, mode) == 0);
  }

  SignalsHeld held_;  // the last to go
  fs::path target_;
  fs::path path_;
  int file_ = -1;
  bool in_place_ = false;
};

}  // namespace

void build_store(const fs::path& store, const fs::path& folder) {
  const fs::path target = target_of(store);
  const Layouts layouts = read_layouts(folder / "layouts.csv");
  const CsvFile tables = read_csv(folder / "tables.csv");
  const std::size_t table = tables.column("table");
  const std::size_t layout = tables.column("layout");
  const std::size_t file = tables.column("file");
  Builder builder;
  for (const CsvRecord& r : tables.records) {
    const auto found = layouts.find(r.cells[layout]);
    if (found == layouts.end()) {
      throw SourceError(tables.path, r.line,
                        "column layout: no layout \"" + r.cells[layout] + "\"");
    }
    const CsvFile rows = read_csv(folder / r.cells[file]);
    try {
      builder.add(r.cells[table], found->second, rows);
    } catch (const StoreError& e) {  // a table that stands twice
      throw SourceError(tables.path, r.line, "table " + r.cells[table] + ": " + e.what());
    }
  }
  const Bytes bytes = builder.finish();
  Draft draft(target);
  draft.write(bytes);
  draft.put_in_place();
}

}  // namespace tabdll
