/* What a C library has no single function for, put together from those that it has. */
#define _GNU_SOURCE  // NOLINT(bugprone-reserved-identifier): for strcasestr
#include <stdlib.h>
#include <string.h>

#if defined(__PICOLIBC_VERSION__)
const char library[] = "picolibc " __PICOLIBC_VERSION__;
#else
const char library[] = "newlib " _NEWLIB_VERSION;
#endif

int peer_split(char* str, const char* dlmt, char** wrd) {
  char* state;
  int num = 0;
  for (char* tk = strtok_r(str, dlmt, &state); tk; tk = strtok_r(NULL, dlmt, &state)) {
    wrd[num++] = tk;
  }
  return num;
}

int peer_trim(char* str, const char* set) {
  char* const first = str + strspn(str, set);
  size_t kept = strlen(first);
  while (kept > 0 && strchr(set, first[kept - 1])) kept--;
  first[kept] = 0;
  memmove(str, first, kept + 1);
  return (int)kept;
}

int peer_replace(const char* orig, const char* rep, const char* with, char* result) {
  const size_t skip = strlen(rep);
  const size_t put = strlen(with);
  char* out = result;
  for (const char* ins; (ins = strstr(orig, rep)); orig = ins + skip) {
    memcpy(out, orig, (size_t)(ins - orig));
    out += ins - orig;
    memcpy(out, with, put);  // NOLINT(bugprone-not-null-terminated-result): more follows
    out += put;
  }
  strcpy(out, orig);
  return (int)(out - result) + (int)strlen(out);
}

// The linker keeps what this names and drops all else.
void (*const peers[])(void) = {
    (void (*)(void))strlen,      (void (*)(void))strupr,     (void (*)(void))strlwr,
    (void (*)(void))strcpy,      (void (*)(void))strlcpy,    (void (*)(void))strncpy,
    (void (*)(void))strcat,      (void (*)(void))strlcat,    (void (*)(void))strchr,
    (void (*)(void))strstr,      (void (*)(void))strcasestr, (void (*)(void))strncmp,
    (void (*)(void))strncasecmp, (void (*)(void))strcmp,     (void (*)(void))strcasecmp,
    (void (*)(void))strtok_r,    (void (*)(void))itoa,       (void (*)(void))atoi,
    (void (*)(void))peer_split,  (void (*)(void))peer_trim,  (void (*)(void))peer_replace,
};
