// A geomagnetic model of the parameter store at a date.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tidewater/magnetic.h"

namespace tidewater::command {

// Field and elements at a position, and their change in a year; nT and radians.
struct MagneticField {
  CoordinateTriple vector;  // north, east, down
  MagneticElements elements;
  CoordinateTriple vector_rates;
  MagneticElements rates;
};

class MagneticModel {
 public:
  // The model of that name, or without one the model of the newest coefficients.  Throws
  // std::runtime_error where the store has no such model, or the model no field at that date.
  MagneticModel(const std::string& store, const std::string& name, double date);

  const std::string& name() const { return name_; }
  // The years that the model is published for; it may reach a few years further.
  double first_date() const { return first_date_; }
  double last_date() const { return last_date_; }

  // The field at points on WGS 84.
  std::vector<MagneticField> at(const std::vector<CoordinateTriple>& points);

 private:
  struct Info;

  class Triangle {
   public:
    Triangle() = default;
    explicit Triangle(int32_t degree);
    // A move takes the block along, and the rows keep pointing into it.
    Triangle(Triangle&&) = default;
    Triangle& operator=(Triangle&&) = default;

    double** rows() { return rows_.data(); }

   private:
    std::vector<double> block_;
    std::vector<double*> rows_;
  };

  // A series, and what the library remembers of its sums.
  struct Series {
    void reserve(int32_t degree);

    int32_t degree = 0;
    Triangle cosines, sines;
    std::vector<double> dC, dS, lC, lS, rC, rS, C, S;
    double last_colat = 0, last_radius = 0;
    double tcos = 0, tsin = 0, scale_theta = 0, scale_lambda = 0, scale_r = 0;
  };

  void set_date(const std::string& store, const Info& info, double date);

  std::string name_;
  double first_date_ = 0;
  double last_date_ = 0;
  double radius_ = 0;
  double last_lon_ = 0;
  Triangle rec_a_, rec_b_;
  Series main_, secular_;
};

}  // namespace tidewater::command
