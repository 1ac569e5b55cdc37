// Reads past the end of its memory, or overflows, which sanitizers must see.
#include <climits>
#include <vector>

int main(int argc, char**) {
  const std::vector<char> memory(8);
  return argc > 1 ? INT_MAX - 1 + argc : memory.data()[7 + argc];  // NOLINT
}
