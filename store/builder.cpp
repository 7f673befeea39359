#include "builder.hpp"

#include <charconv>
#include <cmath>
#include <limits>
#include <map>

#include "csv.hpp"
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

class Builder {
 public:
  explicit Builder(const fs::path& path) {
    sqlite3* opened = nullptr;
    const int code = sqlite3_open_v2(path.string().c_str(), &opened,
                                     SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE, nullptr);
    database_.reset(opened);
    if (code != SQLITE_OK) throw SourceError(path.string() + ": cannot be written");
    run("PRAGMA journal_mode = OFF");
    run("PRAGMA synchronous = OFF");  // an unfinished file is thrown away
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

  void finish() { run("COMMIT"); }

 private:
  void run(const std::string& sql) {
    Statement s(database_.get(), sql);
    s.step();
  }

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

// A file that is removed again unless it is put in its place.
class Draft {
 public:
  explicit Draft(const fs::path& target) : target_(target), path_(target.string() + ".new") {
    fs::remove(path_);
  }
  ~Draft() {
    std::error_code ignored;
    fs::remove(path_, ignored);
  }
  Draft(const Draft&) = delete;
  Draft& operator=(const Draft&) = delete;

  const fs::path& path() const { return path_; }
  void put_in_place() { fs::rename(path_, target_); }

 private:
  fs::path target_;
  fs::path path_;
};

}  // namespace

void build_store(const fs::path& store, const fs::path& folder) {
  const Layouts layouts = read_layouts(folder / "layouts.csv");
  const CsvFile tables = read_csv(folder / "tables.csv");
  const std::size_t table = tables.column("table");
  const std::size_t layout = tables.column("layout");
  const std::size_t file = tables.column("file");
  Draft draft(store);
  {
    Builder builder(draft.path());
    for (const CsvRecord& r : tables.records) {
      const auto found = layouts.find(r.cells[layout]);
      if (found == layouts.end()) {
        throw SourceError(tables.path, r.line,
                          "column layout: no layout \"" + r.cells[layout] + "\"");
      }
      const CsvFile rows = read_csv(folder / r.cells[file]);
      try {
        builder.add(r.cells[table], found->second, rows);
      } catch (const StoreError& e) {  // a table that stands twice, a disk that is full
        throw SourceError(tables.path, r.line, "table " + r.cells[table] + ": " + e.what());
      }
    }
    builder.finish();
  }
  draft.put_in_place();
}

}  // namespace tabdll
