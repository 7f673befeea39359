// Draws world maps with Tissot's indicatrices: circles of one size on the sphere, as each
// projection shows them.  Writes an SVG picture to standard output.

#include <tidewater/tidewater.h>

#include <cmath>
#include <cstdio>
#include <functional>
#include <vector>

namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kDegree = kPi / 180;
constexpr double kPanelWidth = 420;
constexpr double kPanelHeight = 260;

using Points = std::vector<CoordinateTriple>;
// Projects points in place; false when not all of them can be shown.
using Projection = std::function<bool(Points&)>;

struct Panel {
  const char* name;
  Projection projection;
  double south, north;  // latitudes shown, degrees
  double width;         // of the plane, in units of the radius
  double middle;        // ordinate of the picture's centre
};

int32_t count_of(const Points& points) { return static_cast<int32_t>(points.size()); }

Points circle(double lon, double lat, double radius) {
  Points points(49);
  for (std::size_t i = 0; i < points.size(); ++i) {
    double back = 0;
    TWstatus status = 0;
    TWgeodesic_dir({lon, lat, 0}, static_cast<double>(i) * 7.5 * kDegree, radius, 1, 0, &points[i],
                   &back, &status);
  }
  return points;
}

class Drawing {
 public:
  Drawing(const Panel& panel, double left, double top)
      : panel_(panel),
        scale_(kPanelWidth / panel.width),
        x_(left + kPanelWidth / 2),
        y_(top + kPanelHeight / 2 + panel.middle * scale_) {}

  void line(Points points, const char* style) const {
    if (!panel_.projection(points)) return;
    std::printf("<path class='%s' d='", style);
    char command = 'M';
    for (const CoordinateTriple& p : points) {
      std::printf("%c%.1f %.1f", command, x_ + p.x * scale_, y_ - p.y * scale_);
      command = 'L';
    }
    std::printf("'/>\n");
  }

  void draw() const {
    const auto along = [](double from, double to, auto point) {
      Points points;
      for (int i = 0; i <= 60; ++i)
        points.push_back(point((from + (to - from) * i / 60) * kDegree));
      return points;
    };
    for (double lon = -180; lon <= 180; lon += 30) {
      const double bound = std::copysign(std::fmin(std::fabs(lon), 179.999), lon) * kDegree;
      line(along(panel_.south, panel_.north,
                 [bound](double lat) {
                   return CoordinateTriple{bound, lat, 0};
                 }),
           "graticule");
    }
    for (double lat = panel_.south; lat <= panel_.north; lat += 15) {
      line(along(-179.999, 179.999,
                 [lat](double lon) {
                   return CoordinateTriple{lon, lat * kDegree, 0};
                 }),
           "graticule");
    }
    for (double lat = -60; lat <= 60; lat += 30) {
      if (lat - 6 < panel_.south || lat + 6 > panel_.north) continue;
      for (double lon = -150; lon <= 150; lon += 30) {
        line(circle(lon * kDegree, lat * kDegree, 5 * kDegree), "circle");
      }
    }
  }

 private:
  const Panel& panel_;
  double scale_, x_, y_;
};

}  // namespace

int main() {
  std::vector<double> knots(19), y_coef(76), x_coef(76);
  double robinson_y0 = 0, van_y0 = 0;
  TWstatus status = 0;
  TWrobin_c(knots.data(), y_coef.data(), x_coef.data(), &robinson_y0, 0, &status);
  TWvdg_c(0, &van_y0);
  double C = 0, n = 0, rho0 = 0;
  TWalbers_c(0, 0, 30 * kDegree, 20 * kDegree, 60 * kDegree, &n, &C, &rho0);

  const Panel panels[] = {
      {"Mercator",
       [](Points& p) {
         TWstatus word = 0;
         TWmerc_f(0, 0, 0, count_of(p), p.data(), p.data(), &word);
         return TW_OK(word);
       },
       -75, 75, 8.2, 0},
      {"Robinson",
       [&](Points& p) {
         TWstatus word = 0;
         TWrobin_f(knots.data(), y_coef.data(), x_coef.data(), 0, robinson_y0, count_of(p),
                   p.data(), p.data(), &word);
         return TW_OK(word);
       },
       -90, 90, 5.6, 0},
      {"Mollweide",
       [](Points& p) {
         TWstatus word = 0;
         TWmollweide_f(0, 0, count_of(p), p.data(), p.data(), &word);
         return TW_OK(word);
       },
       -90, 90, 6, 0},
      {"Sinusoidal",
       [](Points& p) {
         TWstatus word = 0;
         TWsinusoidal_f(0, 0, 0, 0, 0, count_of(p), p.data(), p.data(), &word);
         return TW_OK(word);
       },
       -90, 90, 6.6, 0},
      {"van der Grinten",
       [&](Points& p) {
         TWstatus word = 0;
         TWvdg_f(0, van_y0, count_of(p), p.data(), p.data(), &word);
         return TW_OK(word);
       },
       -75, 75, 10.5, 0},
      {"Albers",
       [&](Points& p) {
         TWstatus word = 0;
         TWalbers_f(0, 0, n, C, rho0, count_of(p), p.data(), p.data(), &word);
         return TW_OK(word);
       },
       -30, 90, 6.6, 0.1},
  };

  constexpr int kColumns = 3;
  std::printf("<svg xmlns='http://www.w3.org/2000/svg' viewBox='0 0 %g %g'>\n",
              kColumns * kPanelWidth, 2 * kPanelHeight);
  std::printf(
      "<style>path{fill:none;stroke-width:.7}.graticule{stroke:#9ab}"
      ".circle{stroke:#246;fill:#48a;fill-opacity:.45}"
      "text{font:13px sans-serif;fill:#246}</style>\n"
      "<rect width='100%%' height='100%%' fill='#fff'/>\n");
  int i = 0;
  for (const Panel& panel : panels) {
    const double left = i % kColumns * kPanelWidth;
    const double top = i / kColumns * kPanelHeight;
    std::printf("<svg x='%g' y='%g' width='%g' height='%g'>\n", left, top, kPanelWidth,
                kPanelHeight);
    Drawing(panel, 0, 0).draw();
    std::printf("<text x='8' y='18'>%s</text>\n</svg>\n", panel.name);
    ++i;
  }
  std::printf("</svg>\n");
}
