#include "status_name.hpp"

#include <stdexcept>

namespace tidewater::command {

namespace {

struct Word {
  TWstatus status;
  const char* name;
  const char* meaning;
};

#define TIDEWATER_WORD(word, meaning) \
  { word, #word, meaning }
constexpr Word kWords[] = {
    TIDEWATER_WORD(TW_SUCCESS, "success"),
    TIDEWATER_WORD(TW_FAILURE, "a step failed"),
    TIDEWATER_WORD(TW_RANGE_ERROR, "the formula has no answer there"),
    TIDEWATER_WORD(TW_BAD_ECCENTRICITY, "not the eccentricity of an ellipsoid"),
    TIDEWATER_WORD(TW_BAD_LONGITUDE, "longitude beyond 360 degrees"),
    TIDEWATER_WORD(TW_BAD_LATITUDE, "latitude out of range"),
    TIDEWATER_WORD(TW_BAD_SCALE_LATITUDE, "scale out of range"),
    TIDEWATER_WORD(TW_BAD_DATE, "date outside the model's span"),
    TIDEWATER_WORD(TW_BAD_STANDARD_PARALLEL, "standard parallel at a pole"),
    TIDEWATER_WORD(TW_BAD_SEMI_MAJOR, "semi-major axis not above zero"),
    TIDEWATER_WORD(TW_DIVERGED, "the iteration ran away"),
    TIDEWATER_WORD(TW_BAD_ZONE, "no such zone"),
    TIDEWATER_WORD(TW_BAD_HEMISPHERE, "no such hemisphere"),
    TIDEWATER_WORD(TW_BAD_TEXT, "not a position in the given format"),
    TIDEWATER_WORD(TW_BAD_INPUT, "mode or flag out of range"),
    TIDEWATER_WORD(TW_NOT_CONVERGED, "no solution found"),
    TIDEWATER_WORD(TW_NO_MEMORY, "out of memory"),
    TIDEWATER_WORD(TW_BAD_DATA, "unusable data"),
    TIDEWATER_WORD(TW_BAD_PARAMETER, "parameters do not fit together"),
    TIDEWATER_WORD(TW_SINGULAR, "the transformation has no inverse"),
    TIDEWATER_WORD(TW_NO_SUCH_MODEL, "the store has no such model"),
    TIDEWATER_WORD(TW_BAD_HARMONIC_MODEL, "unusable harmonic model"),
    TIDEWATER_WORD(TW_GEOID_FILE_ERROR, "the list of geoid grids cannot be used"),
    TIDEWATER_WORD(TW_GRID_FILE_ERROR, "a shift grid cannot be used"),
    TIDEWATER_WORD(TW_BAD_TOLERANCE, "tolerance of zero"),
    TIDEWATER_WORD(TW_NO_SUCH_SYSTEM, "the store has no such system"),
    TIDEWATER_WORD(TW_PF_OPEN_ERROR, "the parameter store cannot be opened"),
    TIDEWATER_WORD(TW_PF_TABLE_ERROR, "a table of the parameter store cannot be read"),
    TIDEWATER_WORD(TW_NO_SUCH_VERT_DATUM, "the store has no such vertical datum"),
    TIDEWATER_WORD(TW_BUFFER_TOO_SMALL, "fewer than two points"),
    TIDEWATER_WORD(TW_GEOID_READ_ERROR, "a geoid grid cannot be read"),
    TIDEWATER_WORD(TW_GSB_READ_ERROR, "the national grid cannot be read"),
    TIDEWATER_WORD(TW_GRID_NOT_FOUND, "area.par cannot be opened, or names nothing"),
    TIDEWATER_WORD(TW_NO_SUCH_SATELLITE, "the store has no such satellite"),
    TIDEWATER_WORD(TW_W_NO_POINTS, "the line is shorter than the spacing"),
    TIDEWATER_WORD(TW_I_LATITUDE_LIMITED, "a value was held at its limit"),
    TIDEWATER_WORD(TW_I_OUTSIDE_NADCON, "outside the shift grids"),
    TIDEWATER_WORD(TW_I_OUTSIDE_GEOID, "outside the geoid grids"),
    TIDEWATER_WORD(TW_I_OUTSIDE_CNT, "outside the shift grids"),
};
#undef TIDEWATER_WORD

const Word* find(TWstatus status) {
  for (const Word& word : kWords) {
    if (word.status == status) return &word;
  }
  return nullptr;
}

}  // namespace

const char* status_name(TWstatus status) {
  const Word* word = find(status);
  return word ? word->name : "unknown status";
}

const char* status_meaning(TWstatus status) {
  const Word* word = find(status);
  return word ? word->meaning : "unknown status";
}

void require(TWstatus status, const std::string& what) {
  if (TW_OK(status)) return;
  throw std::runtime_error(what + ": " + status_meaning(status) + " (" + status_name(status) + ")");
}

}  // namespace tidewater::command
