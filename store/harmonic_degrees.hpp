// The degrees of the harmonic models in a store, held against the rows of their coefficients.
#pragma once

#include <cstddef>
#include <string>

namespace tabdll {

class TableStore;

// Rows of a coefficient table of degree N: one for each (n, m), 0 <= m <= n <= N.
constexpr std::size_t rows_of_degree(std::size_t degree) { return (degree + 1) * (degree + 2) / 2; }

// The first epoch of a magnetic model whose coefficient table has fewer rows than its degree needs;
// empty where there is none.  The library repeats the last row of a table that is too short, which
// gives a field that no model has, and its users allocate by the degree.  What the library or its
// users refuse, and a table that is missing or packed otherwise, is no fault here.
std::string fault_of_harmonic_degrees(const TableStore& store);

}  // namespace tabdll
