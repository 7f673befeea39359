// Builds a store file from a folder of comma-separated files.
#pragma once

#include <filesystem>

namespace tabdll {

// The folder holds
// - layouts.csv (layout, column, type, offset, size): the packed rows; several tables may share
// one;
// - tables.csv (table, layout, file): the tables and where their rows stand;
// - the files that it names, with a header of the layout's columns in any order.
// Rows keep the order of their file.  An error is thrown as a SourceError and leaves no store, or
// the one that was there before.
void build_store(const std::filesystem::path& store, const std::filesystem::path& folder);

}  // namespace tabdll
