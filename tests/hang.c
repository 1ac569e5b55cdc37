/* A firmware that never answers. */
#include <stdio.h>

FILE *const stdin, *const stdout, *const stderr;

void _exit(int status) {
  (void)status;
  for (;;) {
  }
}

int main(void) {
  for (;;) {
    __asm volatile("wfi");  // lets the emulator rest
  }
}
