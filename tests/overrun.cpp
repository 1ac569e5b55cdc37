// Makes the library read past the end of its memory or, with an argument, at a misaligned address.
#include <vector>

#include "strutil.h"

int main(int argc, char**) {
  const std::vector<char> memory(8, 'a');
  const void* const misaligned = memory.data() + 1;
  return argc > 1 ? WStrLen(static_cast<const WCHAR*>(misaligned)) : StrLen(memory.data());
}
