/* A client in C: one projection, one status word, one look into a store. */
#include <math.h>
#include <stdio.h>
#include <string.h>
#include <tidewater/store.h>
#include <tidewater/tidewater.h>

int main(int argc, char** argv) {
  CoordinateTriple point = {-1.308996938995747, 0.6108652381980153, 0}; /* 75 W, 35 N */
  TWstatus status = 0;
  TWmerc_f(0.0822719, 3.141592653589793, 0, 1, &point, &point, &status);
  /* Snyder 1987, p. 267 */
  if (status != TW_SUCCESS || fabs(point.x * 6378206.4 - 11688673.7) > 0.1 ||
      fabs(point.y * 6378206.4 - 4139145.6) > 0.1) {
    return 1;
  }
  int32_t count = 0;
  TWget_cs_cnt("no such store", -1, &count, &status);
  if (status != TW_PF_OPEN_ERROR) return 2;
  if (argc > 1) {
    char name[41] = "";
    TWget_cs_cnt(argv[1], -1, &count, &status);
    if (status != TW_SUCCESS || count < 1) return 3;
    TWnum_to_cs(argv[1], 1, name, &status);
    if (status != TW_SUCCESS || strlen(name) == 0) return 4;
    printf("%d systems; number 1 is %s\n", (int)count, name);
  }
  return OLB7R3_PF_open("no such store") == TW_STORE_SUCCESS ? 5 : 0;
}
