// Datum steps by grids.
#include "operation.hpp"

namespace tidewater::detail {

bool is_shift_grid(int method) { return method == 9615 || method == 9613 || method == 9614; }

std::string shift_grid_file(const OperationRecord&, const std::vector<std::string>&) { return ""; }

std::unique_ptr<const DatumStep> shift_grid_step(const Link& link, const Frame&, const Frame&,
                                                 const std::vector<std::string>&) {
  throw Error(in_words(link) + " needs a grid, which cannot be read.");
}

std::unique_ptr<const DatumStep> shift_grid_step(const std::string& file, bool, const Frame&,
                                                 const Frame&, const std::vector<std::string>&) {
  throw Error("The grid " + file + " cannot be read.");
}

}  // namespace tidewater::detail
