/* A program that fails, which must be seen. */
#include <stdio.h>

int main(void) {
  puts("failing");
  return 1;
}
