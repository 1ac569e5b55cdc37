/* The header in a C program, included first and alone. */
#include "strutil.h"

int main(void) {
  const WCHAR wide[] = {'A', 'b', 0};
  char copy[4];
  StrCopyBuf(copy, 4, "Abc");
  return StrICmp(copy, "aBC") == 0 && WStrLen(wide) == 2 ? 0 : 1;
}
