/* A program of a user, as C and as C++. */
#include <base_types.h>
#include <strutil.h>

int main(void) {
  const char text[] = {'a', (char)0xE9, 0};
  return StrLen(text) == 2 ? 0 : 1;
}
