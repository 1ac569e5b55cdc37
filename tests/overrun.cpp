// Has the library read past the end of its memory, or, with an argument, at an odd address.
#include <vector>

#include "strutil.h"

int main(int argc, char**) {
  const std::vector<char> memory(8, 'a');
  const void* const odd = memory.data() + 1;
  return argc > 1 ? WStrLen(static_cast<const WCHAR*>(odd)) : StrLen(memory.data());
}
