/* A test program that fails: its exit status must reach the host. */
#include <stdio.h>

int main(void) {
  puts("failing");
  return 1;
}
