#include "points/operations.hpp"

namespace tidewater::test {

std::vector<Operation>& operations() {
  static std::vector<Operation> all;
  return all;
}

}  // namespace tidewater::test
