// Writes a control file of N points for the translation benchmark:
// make_control N path
#include <cstdio>
#include <cstdlib>
#include <string>

int main(int argc, char** argv) {
  if (argc != 3) {
    std::fprintf(stderr, "usage: make_control N path\n");
    return 2;
  }
  long n = std::atol(argv[1]);
  std::FILE* f = std::fopen(argv[2], "wb");
  if (!f) return 1;
  std::fputs(
      "PR:Benchmark job\r\nAC:PR\r\nCS:State Plane 1983\r\nZN:Wisconsin Central 4802\r\n"
      "HD:NAD 83\r\nVD:NAVD 88\r\nUL:F\r\n",
      f);
  for (long i = 0; i < n; ++i) {
    double north = 240000.0 + (i % 1000) * 12.3456;
    double east = 2070000.0 + (i / 1000) * 9.8765;
    int sec = static_cast<int>(i % 60);
    std::fprintf(f,
                 "AC:OS\r\nPN:P%ld\r\nYC:%.4f\r\nXC:%.4f\r\nZC:%.4f\r\nLT:44.30%02d12345\r\n"
                 "LG:89.36%02d54321\r\nHE:%.3f\r\nPD:IRON PIN %ld\r\nFE:CTLMON\r\n"
                 "SY:0.0394\r\nSX:0.0328\r\nSZ:0.0656\r\n",
                 i % 10000000, north, east, 1100.0 + (i % 97) * 0.25, sec, sec,
                 990.0 + (i % 97) * 0.25, i);
  }
  return std::fclose(f) == 0 ? 0 : 1;
}
