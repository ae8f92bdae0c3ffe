// Links one layer library as a whole with the layers it may use (see
// src/CMakeLists.txt); it runs nothing.
int main() {
  return 0;
}
