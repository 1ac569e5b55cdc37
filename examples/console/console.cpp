// A device console, the kind that a product has on its serial port: reads command lines as they are
// typed, answers them, and lives within fixed buffers.
#include <stdio.h>

#include "strutil.h"

namespace {

constexpr int lineSize = 64;  // capacities in bytes, terminators included
constexpr int nameSize = 8;
constexpr int valueSize = 16;

enum Key { ctrlD = 4, bell = 7, backspace = 8, erase = 127 };

struct Setting {
  char name[nameSize];
  char value[valueSize];
};

Setting settings[4];
int settingCount = 0;

Setting* findSetting(const char* name) {
  for (int i = 0; i < settingCount; ++i) {
    if (StrICmp(settings[i].name, name) == 0) return &settings[i];
  }
  return nullptr;
}

// Splits the first word off `text` and returns it; `text` moves on to what follows it.
char* firstWord(char*& text) {
  int off = 0;
  char* const word = StrToken(text, &off, " ");
  text += off;
  StrTrim(text, " ");
  return word;
}

void length(char* text) { printf("%d\n", StrLen(text)); }

void upper(char* text) { printf("%s\n", StrUpper(text)); }

void find(char* text) {
  const char* const needle = firstWord(text);
  const char* const exact = StrStr(text, needle);
  const char* const found = exact ? exact : StrIStr(text, needle);
  if (found) {
    printf("at %d%s: %s\n", static_cast<int>(found - text), exact ? "" : " (ignoring case)", found);
  } else {
    printf("not found: \"%s\"\n", needle);
  }
}

void words(char* text) {
  char* word[lineSize / 2];
  const int count = StrSplit(text, " ,;", word);
  printf("%d:", count);
  for (int i = 0; i < count; ++i) printf(" [%s]", word[i]);
  printf("\n");
}

void set(char* text) {
  int off = 0;
  char* const name = StrToken(text, &off, "=");
  char* const value = text + off;
  if (!name || StrTrim(name, " ") == 0 || StrTrim(value, " ") == 0) {
    printf("usage: set NAME = VALUE\n");
    return;
  }
  Setting* setting = findSetting(name);
  if (StrLen(name) >= nameSize || StrLen(value) >= valueSize) {
    printf("too long: NAME has at most %d bytes, VALUE %d\n", nameSize - 1, valueSize - 1);
  } else if (!setting && settingCount == sizeof settings / sizeof *settings) {
    printf("no room: all %d settings are in use\n", settingCount);
  } else {
    if (!setting) {
      setting = &settings[settingCount++];
      StrCopy(setting->name, name);
    }
    StrCopy(setting->value, value);
    printf("%s = %s\n", setting->name, setting->value);
  }
}

void append(char* text) {
  const char* const name = firstWord(text);
  if (Setting* const setting = findSetting(name)) {
    const int wanted = StrLen(setting->value) + StrLen(text);
    StrCatBuf(setting->value, valueSize, text);
    printf("%s = %s", setting->name, setting->value);
    const int lost = wanted - StrLen(setting->value);
    if (lost > 0) printf(" (truncated by %d bytes: VALUE has at most %d)", lost, valueSize - 1);
    printf("\n");
  } else {
    printf("not set: \"%s\"\n", name);
  }
}

void fill(char* text) {
  char filled[2][lineSize];
  StrCopy(filled[0], text);
  for (int i = 0; i < settingCount; ++i) {
    char pattern[nameSize + 3] = "${";
    StrCat(pattern, settings[i].name);
    StrCat(pattern, "}");
    const char* const from = filled[i % 2];
    const int size = StrReplace(from, pattern, settings[i].value, nullptr) + 1;
    if (size > lineSize) {
      printf("too long: %d bytes (max %d)\n", size - 1, lineSize - 1);
      return;
    }
    StrReplace(from, pattern, settings[i].value, filled[(i + 1) % 2]);
  }
  printf("%s\n", filled[settingCount % 2]);
}

// Reads a whole word as a decimal number.
bool readNumber(const char* word, int& value) {
  char rest[lineSize];
  StrCopyBuf(rest, lineSize, *word == '-' ? word + 1 : word);
  const int digits = StrLen(rest);
  value = StrToInt(word);
  return digits > 0 && digits < 10 && StrTrim(rest, "0123456789") == 0;
}

void number(char* text) {
  int value = 0;
  int radix = 10;
  char digits[34];
  if (!readNumber(firstWord(text), value) || (*text != 0 && !readNumber(text, radix))) {
    printf("a number must have 1 to 9 digits\n");
  } else if (radix < 2 || radix > 36) {
    printf("the radix must be 2 to 36\n");
  } else {
    printf("%s\n", IntToStr(value, digits, radix));
  }
}

void label(char* text) {
  WCHAR wide[lineSize] = {0x2192, ' ', 0};  // an arrow, which no narrow string has
  WCHAR units[lineSize];
  WStrCatBuf(wide, lineSize, StrToWStr(text, units, lineSize));
  char shown[lineSize * 9];  // no unit takes more than 9
  WStrToStr(WStrUpper(wide), shown, sizeof shown);
  printf("%d units: %s\n", WStrLen(wide), shown);
}

void help(char*);

struct Command {
  const char* name;
  const char* arguments;
  void (*run)(char* text);
};

constexpr Command commands[] = {
    {"length", "TEXT", length},
    {"upper", "TEXT", upper},
    {"find", "NEEDLE TEXT", find},
    {"words", "TEXT", words},
    {"set", "NAME = VALUE", set},
    {"append", "NAME TEXT", append},
    {"fill", "TEXT WITH ${NAME}", fill},
    {"number", "VALUE [RADIX]", number},
    {"label", "TEXT", label},
    {"help", "", help},
    {"quit", "or Ctrl-D", nullptr},
};

void help(char*) {
  for (const Command& command : commands) {
    printf(*command.arguments == 0 ? "%s\n" : "%s %s\n", command.name, command.arguments);
  }
}

// Returns whether the session goes on.
bool answer(char* line) {
  const char* const name = firstWord(line);
  for (const Command& command : commands) {
    if (!name || StrICmp(command.name, name) != 0) continue;
    if (!command.run) return false;
    if (*line == 0 && *command.arguments != 0) {
      printf("usage: %s %s\n", command.name, command.arguments);
    } else {
      command.run(line);
    }
    return true;
  }
  printf("unknown command: \"%s\" (try help)\n", name ? name : "");
  return true;
}

// Reads a line as it is typed, echoes it, and returns its length; -1 at the end of the input. Of a
// line that is too long, only what fits is stored and echoed; each further byte rings the bell.
int readLine(char* line) {
  static bool afterReturn = false;
  int length = 0;
  for (;;) {
    const int c = getchar();
    const bool endsReturn = c == '\n' && afterReturn;
    afterReturn = c == '\r';
    if (endsReturn) continue;
    if (length == 0 && (c == EOF || c == ctrlD)) return -1;
    if (c == EOF || c == ctrlD || c == '\r' || c == '\n') break;
    if (c == backspace || c == erase) {
      if (length == 0) continue;
      --length;
      if (length < lineSize - 1) printf("\b \b");
    } else if (c >= ' ' || c == '\t') {
      if (length < lineSize - 1) {
        line[length] = static_cast<char>(c == '\t' ? ' ' : c);
        putchar(line[length]);
      } else {
        putchar(bell);
      }
      ++length;
    }
  }
  putchar('\n');
  line[length < lineSize ? length : lineSize - 1] = 0;
  return length;
}

}  // namespace

int main() {
  char line[lineSize];
  printf("A device console: try help\n");
  for (bool running = true; running;) {
    printf("> ");
    const int length = readLine(line);
    if (length >= lineSize) {
      printf("line too long: %d bytes (max %d)\n", length, lineSize - 1);
    } else {
      if (length < 0) printf("\n");
      running = length >= 0 && answer(line);
    }
  }
  printf("bye\n");
  return 0;
}
