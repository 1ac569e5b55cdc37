// A device console, the kind that a product has on its serial port: reads command lines as they are
// typed, answers them, and lives within fixed buffers.
#include <stdio.h>

#include "strutil.h"

namespace {

constexpr int lineSize = 64;  // capacities, in units
constexpr int textSize = 16;
constexpr int nameSize = 8;
constexpr int maxWords = lineSize / 2;

constexpr char blanks[] = " ";  // a line has no others

// Ctrl-D, the two ways to erase, and what begins the sequence of an arrow key.
enum Key { endOfInput = 4, bell = 7, backspace = 8, escape = 27, deleteKey = 127 };

struct Setting {
  char name[nameSize];
  char value[textSize];
};

Setting settings[4];
int settingCount = 0;

struct Memory {
  const char* name;
  char text[textSize];
};

Memory memories[] = {{"a", ""}, {"b", ""}};

Memory* findMemory(const char* name) {
  for (Memory& memory : memories) {
    if (StrICmp(memory.name, name) == 0) return &memory;
  }
  printf("no memory is called \"%s\": there are a and b\n", name);
  return nullptr;
}

Setting* findSetting(const char* name) {
  for (int i = 0; i < settingCount; ++i) {
    if (StrICmp(settings[i].name, name) == 0) return &settings[i];
  }
  return nullptr;
}

// Cuts the first word off `text` and returns it; `text` moves on to what follows it.
char* firstWord(char*& text) {
  int off = 0;
  char* const word = StrToken(text, &off, blanks);
  text += off;
  StrTrim(text, blanks);
  return word;
}

void length(char* text) { printf("%d\n", StrLen(text)); }

void upper(char* text) { printf("%s\n", StrUpper(text)); }

void lower(char* text) { printf("%s\n", StrLower(text)); }

void find(char* text) {
  const char* const needle = firstWord(text);
  const char* const exact = StrStr(text, needle);
  const char* const ignoringCase = StrIStr(text, needle);
  if (*text == 0) {
    printf("find \"%s\" in what?\n", needle);
  } else if (exact) {
    printf("at %d: %s\n", static_cast<int>(exact - text), exact);
  } else if (ignoringCase) {
    printf("in other letters at %d: %s\n", static_cast<int>(ignoringCase - text), ignoringCase);
  } else {
    printf("not found\n");
  }
}

void showMemory(const Memory& memory, int wanted) {
  printf("%s holds \"%s\"", memory.name, memory.text);
  const int held = StrLen(memory.text);
  if (held < wanted) printf(", %d cut: it holds no more than %d", wanted - held, textSize - 1);
  printf("\n");
}

void keep(char* text) {
  if (Memory* const memory = findMemory(firstWord(text))) {
    StrCopyBuf(memory->text, textSize, text);
    showMemory(*memory, StrLen(text));
  }
}

void append(char* text) {
  if (Memory* const memory = findMemory(firstWord(text))) {
    const int wanted = StrLen(memory->text) + StrLen(text);
    StrCatBuf(memory->text, textSize, text);
    showMemory(*memory, wanted);
  }
}

void compare(char*) {
  const char* const a = memories[0].text;
  const char* const b = memories[1].text;
  const int exact = StrCmp(a, b);
  const int position = exact < 0 ? -exact : exact;
  if (exact == 0) {
    printf("a and b are equal\n");
  } else {
    printf("a comes %s b by unit %d%s\n", exact < 0 ? "before" : "after", position - 1,
           StrICmp(a, b) == 0 ? ", but only case differs" : "");
  }
}

void words(char* text) {
  char* word[maxWords];
  const int count = StrSplit(text, " \t,;", word);
  printf("%d:", count);
  for (int i = 0; i < count; ++i) printf(" [%s]", word[i]);
  printf("\n");
}

void set(char* text) {
  int off = 0;
  char* const name = StrToken(text, &off, "=");
  char* const value = text + off;
  if (!StrChr("=", *text) && StrTrim(name, blanks) > 0 && StrTrim(value, blanks) > 0) {
    Setting* setting = findSetting(name);
    if (StrLen(name) >= nameSize || StrLen(value) >= textSize) {
      printf("too long: a name has at most %d units, a value %d\n", nameSize - 1, textSize - 1);
    } else if (!setting && settingCount == sizeof settings / sizeof *settings) {
      printf("all %d settings are in use\n", settingCount);
    } else {
      if (!setting) {
        setting = &settings[settingCount++];
        StrCopy(setting->name, name);
      }
      StrCopy(setting->value, value);
      printf("%s = %s\n", setting->name, setting->value);
    }
  } else {
    printf("set NAME = VALUE, please\n");
  }
}

void get(char* name) {
  if (const Setting* const setting = findSetting(name)) {
    printf("%s = %s\n", setting->name, setting->value);
  } else {
    printf("\"%s\" is not set\n", name);
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
    char* const to = filled[(i + 1) % 2];
    const int size = StrReplace(from, pattern, settings[i].value, nullptr) + 1;
    if (size > lineSize) {
      printf("does not fit: %d of %d units\n", size, lineSize);
      return;
    }
    StrReplace(from, pattern, settings[i].value, to);
  }
  printf("%s\n", filled[settingCount % 2]);
}

// Reads a whole word as a decimal number, or says why it is none.
bool readNumber(const char* word, int& value) {
  const bool negative = *word == '-';
  const char* digits = word + (negative ? 1 : 0);
  bool isNumber = *digits != 0;
  for (const char* at = digits; *at != 0; ++at) isNumber = isNumber && StrChr("0123456789", *at);
  if (!isNumber) {
    printf("\"%s\" is no number\n", word);
    return false;
  }
  while (*digits == '0' && digits[1] != 0) ++digits;
  // What does not fit wraps, and then is written in another way than it was read.
  value = StrToInt(word);
  char written[12];
  IntToStr(value, written, 10);
  const bool fits =
      StrCmp(digits, written + (value < 0 ? 1 : 0)) == 0 && (value == 0 || negative == (value < 0));
  if (!fits) printf("%s does not fit: a number has 32 bits\n", word);
  return fits;
}

void number(char* text) {
  int value = 0;
  int radix = 10;
  if (!readNumber(firstWord(text), value) || (*text != 0 && !readNumber(text, radix))) return;
  if (radix < 2 || radix > 36) {
    printf("a radix is 2 to 36\n");
  } else {
    char digits[34];
    printf("%s\n", IntToStr(value, digits, radix));
  }
}

void label(char* text) {
  WCHAR wide[lineSize] = {0x2192, ' ', 0};  // an arrow, which no narrow text has
  WCHAR units[lineSize];
  WStrCatBuf(wide, lineSize, StrToWStr(text, units, lineSize));
  char shown[lineSize * 9];  // no unit takes more than 9
  WStrToStr(WStrUpper(wide), shown, sizeof shown);
  printf("%d units: %s\n", WStrLen(wide), shown);
}

void dump(char* text) {
  WORD raw[lineSize];
  const int count = StrLen(text);
  BytesToWords(text, raw, count);
  for (int i = 0; i < count; ++i) printf("%04x%s", raw[i], i + 1 < count ? " " : "\n");
}

bool running = true;

void quit(char*) { running = false; }

void help(char*);

struct Command {
  const char* name;
  const char* arguments;
  void (*run)(char* text);
};

constexpr Command commands[] = {
    {"length", "TEXT", length},
    {"upper", "TEXT", upper},
    {"lower", "TEXT", lower},
    {"find", "NEEDLE TEXT", find},
    {"keep", "a|b TEXT", keep},
    {"append", "a|b TEXT", append},
    {"compare", "", compare},
    {"words", "TEXT", words},
    {"set", "NAME = VALUE", set},
    {"get", "NAME", get},
    {"fill", "TEXT WITH ${NAME}", fill},
    {"number", "VALUE [RADIX]", number},
    {"label", "TEXT", label},
    {"dump", "TEXT", dump},
    {"help", "", help},
    {"quit", "", quit},
};

void help(char*) {
  for (const Command& command : commands) {
    printf(*command.arguments == 0 ? "%s\n" : "%s %s\n", command.name, command.arguments);
  }
  printf("Ctrl-D quits, too\n");
}

void answer(char* line) {
  const char* const name = firstWord(line);
  if (!name) {
    printf("nothing to do; try help\n");
    return;
  }
  for (const Command& command : commands) {
    if (StrICmp(command.name, name) != 0) continue;
    if (*line == 0 && *command.arguments != 0) {
      printf("an argument is missing: %s %s\n", command.name, command.arguments);
    } else {
      command.run(line);
    }
    return;
  }
  printf("no command is called \"%s\"; try help\n", name);
}

// Reads a line as it is typed, shows it, and returns its length; -1 where the input ends. Of a line
// that is too long, `line` holds, and the other side sees, only what fits; the rest rings the bell.
int readLine(char* line) {
  static bool afterReturn = false;
  int length = 0;
  bool inSequence = false;
  int c = 0;
  for (;;) {
    const bool wasEscape = c == escape;
    c = getchar();
    if (wasEscape && c == '[') {
      inSequence = true;
      continue;
    }
    if (inSequence && c != EOF) {
      inSequence = c < '@';
      continue;
    }
    const bool wasReturn = afterReturn;
    afterReturn = c == '\r';
    if (c == EOF || c == endOfInput) {
      if (length == 0) return -1;
      break;
    }
    if (c == '\n' && wasReturn) continue;
    if (c == '\r' || c == '\n') break;
    if (c == backspace || c == deleteKey) {
      if (length == 0) continue;
      --length;
      if (length < lineSize - 1) {
        // The bytes of one character that follow its first are 128 to 191.
        while (length > 0 && (line[length] & 0xC0) == 0x80) --length;
        printf("\b \b");
      }
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
  while (running) {
    printf("> ");
    const int length = readLine(line);
    if (length < 0) {
      printf("\n");
      break;
    }
    if (length >= lineSize) {
      printf("%d units are too many: a line has at most %d\n", length, lineSize - 1);
    } else {
      answer(line);
    }
  }
  printf("bye\n");
  return 0;
}
