/* What a C library has no single function for, put together from those that it has. */
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
  const char* const first = str + strspn(str, set);
  size_t kept = strlen(first);
  while (kept > 0 && strchr(set, first[kept - 1])) kept--;
  memmove(str, first, kept);
  str[kept] = 0;
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
