// Decodes bytes into calls of the whole API and checks each as the suite does.
#include <fuzzer/FuzzedDataProvider.h>

#define DOCTEST_CONFIG_IMPLEMENT
#include "checks.h"

namespace {

// Mostly letters and separators, which have something to match; any unit now and then. Now and then
// a long text.
template <typename Unit>
Units textFrom(FuzzedDataProvider& data, size_t longest = 40) {
  Units text;
  if (longest >= 40 && data.ConsumeIntegralInRange(0, 7) == 0) {
    text = longText(data.ConsumeIntegralInRange<size_t>(0, 1100));
  }
  for (size_t length = text.size() + data.ConsumeIntegralInRange<size_t>(0, longest);
       text.size() < length;) {
    const auto unit =
        data.ConsumeBool()
            ? data.PickValueInArray<char16_t>({'a', 'A', 'b', ',', ' ', '-', '1', 0xE1})
            : data.ConsumeIntegral<std::make_unsigned_t<Unit>>();
    text += unit == 0 ? u'0' : static_cast<char16_t>(unit);
  }
  return text;
}

int boundFrom(FuzzedDataProvider& data) {
  if (data.ConsumeBool()) return data.ConsumeIntegralInRange(-2, 50);
  return data.ConsumeBool() ? data.ConsumeIntegralInRange(65530, 65590)
                            : data.ConsumeIntegral<int>();
}

template <typename Unit>
void checkOne(FuzzedDataProvider& data) {
  const Units a = textFrom<Unit>(data);
  const Units b = textFrom<Unit>(data, 9);
  const int n = boundFrom(data);
  const int m = boundFrom(data);
  switch (data.ConsumeIntegralInRange(0, 13)) {
    case 0: return checkLengthAndCase<Unit>(a);
    case 1: return checkCopies<Unit>(a, n);
    case 2:
      if (isWide<Unit>) checkCountedAppends(b, a, n, m);
      return checkAppends<Unit>(b, a, n);
    case 3: return checkFindUnit<Unit>(a, b.empty() ? u'\0' : b[0]);
    case 4: return checkFind<Unit>(a, b);
    case 5: return checkCompare<Unit>(a, data.ConsumeBool() ? textFrom<Unit>(data) : a + b, n);
    case 6: return checkWalk<Unit>(a, b, std::clamp(n, 0, static_cast<int>(a.size())));
    case 7: return checkSplit<Unit>(a, b);
    case 8: return checkTrim<Unit>(a, b);
    case 9: return checkReplace<Unit>(a, b.empty() ? u"-" : b, textFrom<Unit>(data, 4));
    case 10: return checkFromInt<Unit>(n, m);
    case 11: return checkToInt<Unit>(data.ConsumeBool() ? model::intToText(n, 10) + b : a);
    case 12: return checkWords(a, std::min(n, static_cast<int>(a.size())));
    default: return sizeof(Unit) == 1 ? checkWiden(a, n) : checkEscape(a, n);
  }
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  static doctest::Context context;
  context.setAsDefaultForAssertsOutOfTestCases();
  tell = [](const std::string& failure) {
    std::fprintf(stderr, "%s\n", failure.c_str());
    std::abort();
  };
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t size) {
  FuzzedDataProvider data(bytes, size);
  while (data.remaining_bytes() > 0) {
    if (data.ConsumeBool()) {
      checkOne<char>(data);
    } else {
      checkOne<WCHAR>(data);
    }
  }
  return 0;
}
