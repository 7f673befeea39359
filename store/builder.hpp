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
// the one that was there before; nothing else in its folder is touched.  The store that is replaced
// leaves its permissions to the new one, a link to it stays a link, and what is no regular file is
// not replaced.
void build_store(const std::filesystem::path& store, const std::filesystem::path& folder);

}  // namespace tabdll
