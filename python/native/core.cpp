// The systems library for Python: its objects, calls on one point, and ufuncs for many.
#include <pybind11/numpy.h>
#include <pybind11/pybind11.h>
#include <pybind11/stl.h>

#include <cmath>

#include "tidewater/grids.hpp"
#include "tidewater/lines.hpp"
#include "tidewater/magnetic_model.hpp"
#include "tidewater/position_text.hpp"
#include "tidewater/systems.h"
#include "tidewater/transformation.hpp"
#include "ufunc.hpp"

namespace py = pybind11;

namespace tidewater::python {

namespace {

// A tuple of Python numbers, quicker than through casts.
template <class... Numbers>
py::object numbers(Numbers... values) {
  PyObject* tuple = PyTuple_New(sizeof...(values));
  if (tuple == nullptr) throw py::error_already_set();
  Py_ssize_t i = 0;
  (PyTuple_SET_ITEM(tuple, i++, PyFloat_FromDouble(values)), ...);
  return py::reinterpret_steal<py::object>(tuple);
}

// An object with a way there and a way back, of which one is meant.
template <class Object>
struct Way {
  Object object;
  bool back = false;

  Point operator()(Point point) const {
    return back ? object.inverse(point) : object.forward(point);
  }
  template <class T, class... How>
  void operator()(std::size_t count, Coordinates<const T> in, Coordinates<T> out,
                  How... how) const {
    if (back) {
      object.inverse(count, in, out, how...);
    } else {
      object.forward(count, in, out, how...);
    }
  }
};

// Points of two or three axes to points.
template <class Object>
class PointKernel final : public Kernel {
 public:
  PointKernel(Way<Object> way, int axes) : Kernel(axes, axes), way_(std::move(way)) {
    strided = true;
    singles = std::is_same_v<Object, Transformation>;
  }
  void run(std::size_t count, const double* const* in, std::ptrdiff_t in_stride, double* const* out,
           std::ptrdiff_t out_stride, TWstatus* words) const override {
    call(count, in, in_stride, out, out_stride, words);
  }
  void run(std::size_t count, const float* const* in, std::ptrdiff_t in_stride, float* const* out,
           std::ptrdiff_t out_stride, TWstatus* words) const override {
    if constexpr (std::is_same_v<Object, Transformation>) {
      call(count, in, in_stride, out, out_stride, words);
    }
  }

 private:
  template <class T>
  void call(std::size_t count, const T* const* in, std::ptrdiff_t in_stride, T* const* out,
            std::ptrdiff_t out_stride, TWstatus* words) const {
    const Coordinates<const T> from = {in[0], in[1], inputs > 2 ? in[2] : nullptr, in_stride};
    const Coordinates<T> to = {out[0], out[1], results > 2 ? out[2] : nullptr, out_stride};
    if constexpr (std::is_same_v<Object, Transformation> || std::is_same_v<Object, Projection>) {
      way_(count, from, to, Run{words, 1});
    } else {
      way_(count, from, to, words);
    }
  }

  Way<Object> way_;
};

// A call that its maker writes as a function of contiguous arrays.
template <class Function>
class FunctionKernel final : public Kernel {
 public:
  FunctionKernel(int input_count, int result_count, Function function)
      : Kernel(input_count, result_count), function_(std::move(function)) {}
  void run(std::size_t count, const double* const* in, std::ptrdiff_t, double* const* out,
           std::ptrdiff_t, TWstatus* words) const override {
    function_(count, in, out, words);
  }

 private:
  Function function_;
};

template <class Function>
py::object function_ufunc(int inputs, int results, bool words, const char* name,
                          Function function) {
  return make_ufunc(
      std::make_unique<FunctionKernel<Function>>(inputs, results, std::move(function)), words,
      name);
}

// Words for calls that tell failures by not-a-numbers alone.
void words_from(std::size_t count, const double* result, TWstatus* words) {
  if (words == nullptr) return;
  for (std::size_t i = 0; i < count; ++i) {
    words[i] = std::isnan(result[i]) ? TW_BAD_INPUT : TW_SUCCESS;
  }
}

// A call that is not of plain numbers, handed to a method of the Python class.
auto handed_to(const char* method) {
  return [method](const py::object& self, const py::args& args, const py::kwargs& kwargs) {
    return self.attr(method)(*args, **kwargs);
  };
}

// What classes with a way there and back share: one point at a time, and the ufuncs.
template <class Object, class Class>
void define_calls(Class& type, const char* name) {
  type.def(
          "__call__",
          [](const Way<Object>& way, double x, double y) {
            const Point point = way({x, y, 0});
            return numbers(point.x, point.y);
          },
          py::arg("x").noconvert(), py::arg("y").noconvert())
      .def(
          "__call__",
          [](const Way<Object>& way, double x, double y, double z) {
            const Point point = way({x, y, z});
            return numbers(point.x, point.y, point.z);
          },
          py::arg("x").noconvert(), py::arg("y").noconvert(), py::arg("z").noconvert())
      .def("__call__", [](const py::object& self, const py::args& args,
                          const py::kwargs& kwargs) { return self.attr("_call")(*args, **kwargs); })
      .def("_ufunc", [name](const Way<Object>& way, int axes, bool words) {
        return make_ufunc(std::make_unique<PointKernel<Object>>(way, axes), words, name);
      });
}

Area area_from(const std::tuple<double, double, double, double>& bounds) {
  const auto& [west, south, east, north] = bounds;
  return {"", west, south, east, north};
}

py::tuple bounds_of(const Area& area) {
  return py::make_tuple(area.west, area.south, area.east, area.north);
}

py::list bounds_list(const std::vector<GridBounds>& bounds) {
  py::list list;
  for (const GridBounds& b : bounds) list.append(py::make_tuple(b.west, b.south, b.east, b.north));
  return list;
}

py::dict dictionary(const std::vector<std::pair<std::string, double>>& parameters) {
  py::dict result;
  for (const auto& [name, value] : parameters) result[py::str(name)] = value;
  return result;
}

const char* kind_name(SystemKind kind) {
  switch (kind) {
    case SystemKind::geographic2d:
      return "geographic 2D";
    case SystemKind::geographic3d:
      return "geographic 3D";
    case SystemKind::geocentric:
      return "geocentric";
    case SystemKind::projected:
      return "projected";
    case SystemKind::vertical:
      return "vertical";
    case SystemKind::compound:
      return "compound";
  }
  return "unknown";
}

TransformationOptions options_from(const std::string& operation,
                                   const std::vector<std::string>& grid_folders,
                                   std::optional<double> epoch,
                                   std::optional<std::tuple<double, double, double, double>> area,
                                   bool radians, bool own_axes) {
  TransformationOptions options;
  options.operation = operation;
  options.grid_folders = grid_folders;
  if (epoch) options.epoch = *epoch;
  if (area) options.area = area_from(*area);
  options.radians = radians;
  options.own_axes = own_axes;
  return options;
}

void define_systems(py::module_& m) {
  py::class_<Ellipsoid>(m, "Ellipsoid")
      .def(py::init<const std::string&>(), py::arg("name"))
      .def(py::init<double, double>(), py::arg("a"), py::arg("inverse_flattening"))
      .def_property_readonly("name", &Ellipsoid::name)
      .def_property_readonly("code", &Ellipsoid::code)
      .def_property_readonly("a", &Ellipsoid::a)
      .def_property_readonly("b", &Ellipsoid::b)
      .def_property_readonly("inverse_flattening", &Ellipsoid::inverse_flattening)
      .def_property_readonly("flattening", &Ellipsoid::flattening)
      .def_property_readonly("eccentricity", &Ellipsoid::eccentricity)
      .def("__repr__",
           [](const Ellipsoid& e) {
             return py::str("Ellipsoid({!r}, {!r})").format(e.a(), e.inverse_flattening());
           })
      .def("__eq__",
           [](const Ellipsoid& one, const Ellipsoid& other) {
             return one.a() == other.a() && one.inverse_flattening() == other.inverse_flattening();
           })
      .def("__hash__",
           [](const Ellipsoid& e) {
             return py::hash(py::make_tuple(e.a(), e.inverse_flattening()));
           })
      .def(py::pickle(
          [](const Ellipsoid& e) {
            return py::make_tuple(e.name(), e.a(), e.inverse_flattening());
          },
          [](const py::tuple& state) {
            const auto name = state[0].cast<std::string>();
            return name.empty() ? Ellipsoid(state[1].cast<double>(), state[2].cast<double>())
                                : Ellipsoid(name);
          }));

  py::class_<System>(m, "System", py::dynamic_attr())
      .def(py::init<const std::string&>())
      .def(py::init<const std::string&, double, double>())
      .def_property_readonly("name", &System::name)
      .def_property_readonly("code", &System::code)
      .def_property_readonly("kind", [](const System& s) { return kind_name(s.kind()); })
      .def_property_readonly("ellipsoid", &System::ellipsoid)
      .def_property_readonly("datum", &System::datum)
      .def_property_readonly("meridian", [](const System& s) { return s.meridian().longitude(); })
      .def_property_readonly("unit", &System::unit)
      .def_property_readonly("unit_factor", &System::unit_factor)
      .def_property_readonly("axes", &System::axes)
      .def_property_readonly("method", &System::method)
      .def_property_readonly("parameters",
                             [](const System& s) { return dictionary(s.parameters()); })
      .def_property_readonly("area", [](const System& s) { return bounds_of(s.area()); })
      .def_property_readonly("area_name", [](const System& s) { return s.area().name; })
      .def("to_proj", &System::to_proj)
      .def("to_wkt", py::overload_cast<std::string_view>(&System::to_wkt, py::const_),
           py::arg("dialect") = "wkt2")
      .def("describe", &System::describe)
      .def("_projection",
           [](const System& s) -> py::object {
             const auto projection = s.projection();
             if (!projection) return py::none();
             return py::cast(Way<Projection>{*projection});
           })
      .def_static(
          "search",
          [](const std::string& words, std::size_t limit) {
            py::list found;
            for (const FoundSystem& f : System::search(words, limit)) {
              found.append(py::make_tuple(f.code, f.name, kind_name(f.kind)));
            }
            return found;
          },
          py::arg("words"), py::arg("limit") = 20);

  py::class_<Way<Transformation>> transformation(m, "Transformation", py::dynamic_attr());
  transformation
      .def(py::init([](const System& source, const System& target, const std::string& operation,
                       const std::vector<std::string>& grid_folders, std::optional<double> epoch,
                       std::optional<std::tuple<double, double, double, double>> area, bool radians,
                       bool own_axes) {
        return Way<Transformation>{Transformation(
            source, target, options_from(operation, grid_folders, epoch, area, radians, own_axes))};
      }))
      .def(py::init([](const Way<Transformation>& other) {
        return Way<Transformation>{other.object, !other.back};
      }))
      .def_property_readonly("accuracy",
                             [](const Way<Transformation>& w) { return w.object.accuracy(); })
      .def_property_readonly("operation",
                             [](const Way<Transformation>& w) { return w.object.operation(); })
      .def_property_readonly(
          "area", [](const Way<Transformation>& w) { return bounds_of(w.object.area()); })
      .def_property_readonly("area_name",
                             [](const Way<Transformation>& w) { return w.object.area().name; })
      .def("_describe", [](const Way<Transformation>& w) { return w.object.describe(); })
      .def_static(
          "_candidates",
          [](const System& source, const System& target,
             const std::vector<std::string>& grid_folders, std::optional<double> epoch,
             std::optional<std::tuple<double, double, double, double>> area) {
            py::list list;
            for (const Candidate& c : Transformation::candidates(
                     source, target, options_from("", grid_folders, epoch, area, false, false))) {
              list.append(
                  py::make_tuple(c.steps, c.name, c.accuracy, bounds_of(c.area), c.missing));
            }
            return list;
          });
  define_calls<Transformation>(transformation, "transform");

  py::class_<Way<Projection>> projection(m, "Projection", py::dynamic_attr());
  projection
      .def(py::init([](const std::string& method,
                       const std::vector<std::pair<std::string, double>>& parameters,
                       const Ellipsoid& ellipsoid) {
        return Way<Projection>{Projection(method, parameters, ellipsoid)};
      }))
      // The other way of another one, or the projection of a system.
      .def(py::init([](const Way<Projection>& other, bool turned) {
        return Way<Projection>{other.object, other.back != turned};
      }))
      .def_property_readonly("method", [](const Way<Projection>& w) { return w.object.method(); })
      .def_property_readonly(
          "parameters", [](const Way<Projection>& w) { return dictionary(w.object.parameters()); })
      .def_property_readonly("ellipsoid",
                             [](const Way<Projection>& w) { return w.object.ellipsoid(); })
      .def("_factors_ufunc",
           [](const Way<Projection>& way, bool words) {
             return function_ufunc(
                 2, 5, words, "factors",
                 [object = way.object](std::size_t count, const double* const* in,
                                       double* const* out, TWstatus* status) {
                   std::vector<Factors> factors(count);
                   object.factors(count, {in[0], in[1]}, factors.data(), Run{status, 1});
                   for (std::size_t i = 0; i < count; ++i) {
                     out[0][i] = factors[i].meridional;
                     out[1][i] = factors[i].parallel;
                     out[2][i] = factors[i].areal;
                     out[3][i] = factors[i].convergence;
                     out[4][i] = factors[i].angular;
                   }
                 });
           })
      .def_static("methods", &Projection::methods);
  define_calls<Projection>(projection, "project");
}

void define_grids(py::module_& m) {
  py::class_<Way<ShiftGrid>> shift(m, "ShiftGrid", py::dynamic_attr());
  shift
      .def(py::init([](const std::string& name, const std::vector<std::string>& folders) {
        return Way<ShiftGrid>{ShiftGrid(name, folders)};
      }))
      .def(py::init([](const Way<ShiftGrid>& other) {
        return Way<ShiftGrid>{other.object, !other.back};
      }))
      .def_property_readonly("path", [](const Way<ShiftGrid>& w) { return w.object.path(); })
      .def_property_readonly("source", [](const Way<ShiftGrid>& w) { return w.object.source(); })
      .def_property_readonly("target", [](const Way<ShiftGrid>& w) { return w.object.target(); })
      .def_property_readonly("bounds",
                             [](const Way<ShiftGrid>& w) { return bounds_list(w.object.bounds()); })
      .def("describe", [](const Way<ShiftGrid>& w) { return w.object.describe(); });
  define_calls<ShiftGrid>(shift, "shift");

  // No call on one point of its own: the library has none for heights.
  py::class_<Way<GeoidGrid>>(m, "GeoidGrid", py::dynamic_attr())
      .def(py::init(
          [](const std::string& name, const std::vector<std::string>& folders, bool biquadratic) {
            return Way<GeoidGrid>{GeoidGrid(name, folders,
                                            biquadratic ? GeoidGrid::Interpolation::biquadratic
                                                        : GeoidGrid::Interpolation::bilinear)};
          }))
      .def(py::init([](const Way<GeoidGrid>& other) {
        return Way<GeoidGrid>{other.object, !other.back};
      }))
      .def_property_readonly("path", [](const Way<GeoidGrid>& w) { return w.object.path(); })
      .def_property_readonly("bounds",
                             [](const Way<GeoidGrid>& w) { return bounds_list(w.object.bounds()); })
      .def("describe", [](const Way<GeoidGrid>& w) { return w.object.describe(); })
      .def("_ufunc",
           [](const Way<GeoidGrid>& way, int axes, bool words) {
             return make_ufunc(std::make_unique<PointKernel<GeoidGrid>>(way, axes), words,
                               "heights");
           })
      .def("_undulation_ufunc", [](const Way<GeoidGrid>& way, bool words) {
        return function_ufunc(2, 1, words, "undulation",
                              [object = way.object](std::size_t count, const double* const* in,
                                                    double* const* out, TWstatus* status) {
                                for (std::size_t i = 0; i < count; ++i) {
                                  out[0][i] = object.undulation(in[0][i], in[1][i]);
                                  if (status == nullptr) continue;
                                  status[i] =
                                      std::isnan(out[0][i]) ? TW_I_OUTSIDE_GEOID : TW_SUCCESS;
                                }
                              });
      });
}

// The package's named tuple of a line, made as a plain tuple is: its own maker takes longer than
// the line itself.  The type is kept for as long as the interpreter lives.
template <class... Numbers>
py::object named(PyTypeObject* type, Numbers... values) {
  auto made = py::reinterpret_steal<py::object>(type->tp_alloc(type, sizeof...(values)));
  if (!made) throw py::error_already_set();
  Py_ssize_t i = 0;
  (PyTuple_SET_ITEM(made.ptr(), i++, py::float_(values).release().ptr()), ...);
  return made;
}
PyTypeObject* tuple_type(const char* name) {
  py::object type = py::module_::import("tidewater._lines").attr(name);
  return reinterpret_cast<PyTypeObject*>(type.release().ptr());
}

template <class Lines>
void define_lines(py::module_& m, const char* name) {
  py::class_<Lines>(m, name)
      .def(py::init<double, double>())
      .def_property_readonly("a", &Lines::a)
      .def_property_readonly("f", &Lines::f)
      .def(
          "inverse",
          [](const Lines& lines, double lon1, double lat1, double lon2, double lat2) {
            const LineCourse course = lines.inverse(lon1, lat1, lon2, lat2);
            static PyTypeObject* const type = tuple_type("Course");
            return named(type, course.length, course.azimuth1, course.azimuth2);
          },
          py::arg("lon1").noconvert(), py::arg("lat1").noconvert(), py::arg("lon2").noconvert(),
          py::arg("lat2").noconvert())
      .def("inverse", handed_to("_inverse"))
      .def(
          "direct",
          [](const Lines& lines, double lon, double lat, double azimuth, double length) {
            const LineEnd end = lines.direct(lon, lat, azimuth, length);
            static PyTypeObject* const type = tuple_type("End");
            return named(type, end.lon, end.lat, end.azimuth);
          },
          py::arg("lon").noconvert(), py::arg("lat").noconvert(), py::arg("azimuth").noconvert(),
          py::arg("length").noconvert())
      .def("direct", [](const py::object& self, const py::args& args,
                        const py::kwargs& kwargs) { return self.attr("_direct")(*args, **kwargs); })
      .def("_inverse_ufunc",
           [](const Lines& lines, bool area, bool words) {
             return function_ufunc(4, area ? 4 : 3, words, "inverse",
                                   [lines, area](std::size_t count, const double* const* in,
                                                 double* const* out, TWstatus* status) {
                                     lines.inverse(
                                         count, {in[0], in[1], in[2], in[3]},
                                         {out[0], out[1], out[2], area ? out[3] : nullptr});
                                     words_from(count, out[0], status);
                                   });
           })
      .def("_direct_ufunc",
           [](const Lines& lines, bool area, bool words) {
             return function_ufunc(4, area ? 4 : 3, words, "direct",
                                   [lines, area](std::size_t count, const double* const* in,
                                                 double* const* out, TWstatus* status) {
                                     lines.direct(
                                         count, LineStarts{in[0], in[1], in[2], in[3]},
                                         LineEnds{out[0], out[1], out[2], area ? out[3] : nullptr});
                                     words_from(count, out[0], status);
                                   });
           })
      .def("_polygon",
           [](const Lines& lines,
              const py::array_t<double, py::array::c_style | py::array::forcecast>& lon,
              const py::array_t<double, py::array::c_style | py::array::forcecast>& lat) {
             const auto count = static_cast<std::size_t>(lon.size());
             PolygonMeasure measure;
             {
               const py::gil_scoped_release unlocked;
               measure = lines.polygon(count, lon.data(), lat.data());
             }
             return numbers(measure.perimeter, measure.area);
           })
      .def(py::pickle([](const Lines& lines) { return py::make_tuple(lines.a(), lines.f()); },
                      [](const py::tuple& state) {
                        return Lines(state[0].cast<double>(), state[1].cast<double>());
                      }));
}

void define_magnetic(py::module_& m) {
  py::class_<MagneticModel>(m, "MagneticModel")
      .def(py::init<const std::string&, double>())
      .def_property_readonly("name", &MagneticModel::name)
      .def_property_readonly("year", &MagneticModel::year)
      .def_property_readonly("first_year", &MagneticModel::first_year)
      .def_property_readonly("last_year", &MagneticModel::last_year)
      .def("_ufunc",
           [](const MagneticModel& model, bool yearly, bool words) {
             return function_ufunc(
                 3, 7, words, "field",
                 [model, yearly](std::size_t count, const double* const* in, double* const* out,
                                 TWstatus* status) {
                   std::vector<MagneticValue> values(count);
                   model.field(count, {in[0], in[1], in[2]}, values.data(), Run{status, 1});
                   for (std::size_t i = 0; i < count; ++i) {
                     const MagneticField& field = yearly ? values[i].yearly : values[i].field;
                     out[0][i] = field.north;
                     out[1][i] = field.east;
                     out[2][i] = field.down;
                     out[3][i] = field.horizontal;
                     out[4][i] = field.total;
                     out[5][i] = field.declination;
                     out[6][i] = field.inclination;
                   }
                 });
           })
      .def_static("models", &MagneticModel::models);
}

// A figure for each text, and a sentence for each that has none.
template <class Read>
py::tuple read_texts(const std::vector<std::string>& texts, int figures, const Read& read) {
  py::array_t<double> result(
      {static_cast<py::ssize_t>(figures), static_cast<py::ssize_t>(texts.size())});
  py::list reasons;
  auto values = result.mutable_unchecked<2>();
  for (std::size_t i = 0; i < texts.size(); ++i) {
    double row[3] = {std::nan(""), std::nan(""), std::nan("")};
    reasons.append(read(texts[i], row));
    for (int k = 0; k < figures; ++k) values(k, static_cast<py::ssize_t>(i)) = row[k];
  }
  return py::make_tuple(result, reasons);
}

void define_text(py::module_& m) {
  m.def("parse_angles", [](const std::vector<std::string>& texts, int axis, bool decimal_comma) {
    return read_texts(texts, 1, [&](const std::string& text, double* row) {
      const ParsedAngle angle = parse_angle(text, static_cast<Axis>(axis), decimal_comma);
      if (angle) row[0] = angle.degrees;
      return angle.reason;
    });
  });
  m.def("parse_positions",
        [](const std::vector<std::string>& texts, int order, bool decimal_comma) {
          return read_texts(texts, 3, [&](const std::string& text, double* row) {
            const ParsedPosition p = parse_position(text, static_cast<Order>(order), decimal_comma);
            if (p) {
              row[0] = p.longitude;
              row[1] = p.latitude;
              row[2] = p.height;
            }
            return p.reason;
          });
        });
  m.def("parse_mgrs", [](const std::vector<std::string>& texts) {
    return read_texts(texts, 2, [&](const std::string& text, double* row) {
      const GridPosition grid = parse_mgrs(text);
      if (!grid) return grid.reason;
      const ParsedPosition p = position_of(grid);
      row[0] = p.longitude;
      row[1] = p.latitude;
      return p.reason;
    });
  });
  m.def("format_angles",
        [](const std::vector<double>& degrees, int form, int marks, int precision, int axis) {
          const AngleFormat format = {static_cast<AngleForm>(form), static_cast<AngleMarks>(marks),
                                      precision, static_cast<Axis>(axis)};
          py::list texts;
          for (const double angle : degrees) texts.append(format_angle(angle, format));
          return texts;
        });
  m.def("format_mgrs", [](const std::vector<double>& lon, const std::vector<double>& lat,
                          int digits, bool blanks) {
    py::list texts;
    for (std::size_t i = 0; i < lon.size(); ++i) {
      texts.append(format_mgrs(lon[i], lat[i], digits, blanks));
    }
    return texts;
  });
}

}  // namespace

PYBIND11_MODULE(_core, m) {
  import_numpy();
  py::register_exception<Error>(m, "Error", PyExc_ValueError);
  m.attr("version") = tw_version();
  m.attr("SUCCESS") = static_cast<unsigned>(TW_SUCCESS);
  m.def("status_text", &tw_status_text, "What a status word says, in a sentence.");
  m.def("set_threads", &set_threads);
  define_systems(m);
  define_grids(m);
  define_lines<Geodesic>(m, "Geodesic");
  define_lines<Rhumb>(m, "Rhumb");
  define_magnetic(m);
  define_text(m);
}

}  // namespace tidewater::python
