/* From one named system to another in C: describes the way, converts a point there and back. */
#include <stdio.h>
#include <stdlib.h>
#include <tidewater/systems.h>

int main(int argc, char** argv) {
  tw_system* source = tw_system_create(argc > 1 ? argv[1] : "EPSG:27572");
  tw_system* target = source == NULL ? NULL : tw_system_create(argc > 2 ? argv[2] : "EPSG:2154");
  tw_transformation* map = target == NULL ? NULL : tw_transformation_create(source, target, NULL);
  if (map == NULL) {
    fprintf(stderr, "%s\n", tw_last_error());
    tw_system_destroy(target);
    tw_system_destroy(source);
    return 1;
  }

  const size_t length = tw_transformation_describe(map, NULL, 0);
  char* text = malloc(length + 1);
  if (text != NULL) {
    tw_transformation_describe(map, text, length + 1);
    fputs(text, stdout);
    free(text);
  }

  double x = 600000, y = 2200000;
  const tw_points point = {&x, &y, NULL, 1};
  TWstatus status = TW_SUCCESS;
  for (int back = 0; back <= 1; ++back) {
    if (tw_transform(map, back, 1, &point, &point, &status, 1) == 0) {
      printf("%.3f %.3f\n", x, y);
    } else {
      printf("%s\n", tw_status_text(status));
    }
  }
  tw_transformation_destroy(map);
  tw_system_destroy(target);
  tw_system_destroy(source);
  return 0;
}
