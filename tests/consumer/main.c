/* A program of a user, as C and as C++. */
#include <base_types.h>
#include <strutil.h>

#ifdef __cplusplus
static_assert(noexcept(StrLen("")), "a caller need not clean up after an exception");
#endif

static WCHAR from[8] __attribute__((aligned(4)));
static WORD to[8] __attribute__((aligned(4)));

/* A compiler that sees the whole program may not take the copy for one of other memory. */
__attribute__((noinline)) static int firstTwo(void) {
  to[0] = 7;
  to[1] = 8;
  WStrToWords(from, to, 8);
  return to[0] + to[1];
}

int main(int argc, char** argv) {
  const char text[] = {'a', (char)0xE9, 0};
  (void)argv;
  from[0] = (WCHAR)argc;
  if (StrLen(text) != 2 || !StrChr(text, (char)0xE9)) return 1;
  return firstTwo() == argc ? 0 : 2;
}
