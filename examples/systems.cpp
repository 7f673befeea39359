// From one named system to another in C++: describes the way, converts an array, says how many
// points failed.
#include <cstddef>
#include <cstdio>
#include <tidewater/transformation.hpp>
#include <vector>

int main(int argc, char** argv) {
  try {
    const tidewater::System source(argc > 1 ? argv[1] : "EPSG:27572");
    const tidewater::System target(argc > 2 ? argv[2] : "EPSG:2154");
    const tidewater::Transformation map(source, target);
    std::fputs(map.describe().c_str(), stdout);

    // Easting and northing in turn; the last point is none.
    std::vector<double> points = {600000, 2200000, 85000, 2350000, 1e9, 0};
    const std::size_t count = points.size() / 2;
    std::vector<TWstatus> words(count);
    const auto view = tidewater::interleaved(points.data(), 2);
    tidewater::Run run;
    run.status = words.data();
    const tidewater::Summary summary = map.forward(count, view, view, run);
    for (std::size_t i = 0; i < count; ++i) {
      std::printf("%.3f %.3f%s\n", points[2 * i], points[2 * i + 1],
                  words[i] == TW_SUCCESS ? "" : " failed");
    }
    std::printf("%zu of %zu points failed\n", summary.failed, count);
    return 0;
  } catch (const tidewater::Error& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 1;
  }
}
