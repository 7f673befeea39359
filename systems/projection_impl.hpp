// A projection as a step, and what it was made from.
#pragma once

#include <memory>
#include <string>

#include "block.hpp"
#include "methods.hpp"

namespace tidewater::detail {

// Between longitude, latitude in radians from the definition's own prime meridian and the plane in
// metres, there and back.
class ProjectionImpl final : public Step {
 public:
  // Throws an Error for a method or parameters that cannot serve.
  explicit ProjectionImpl(const Definition& definition);

  void run(Block& block, bool inverse) const override;

  const Definition& definition() const { return definition_; }
  const Method& method() const { return *method_; }
  std::string truth() const { return std::string(truth_of(method_->code)); }

 private:
  void forward(Block& block) const;
  void inverse(Block& block) const;
  void one_by_one(Block& block, bool inverse) const;

  Definition definition_;
  const Method* method_;
  std::unique_ptr<const Formula> formula_;
};

}  // namespace tidewater::detail
