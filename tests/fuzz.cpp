// Decodes bytes into calls of the whole API and checks each as the suite does.
#include <fuzzer/FuzzedDataProvider.h>

#define DOCTEST_CONFIG_IMPLEMENT
#include "functions.h"

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  static doctest::Context context;
  context.setAsDefaultForAssertsOutOfTestCases();
  report = [](const char*, int, const std::string& failure) {
    std::fprintf(stderr, "%s\n", failure.c_str());
    std::abort();
  };
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t size) {
  FuzzedDataProvider data(bytes, size);
  const auto choose = [&data](size_t n) {
    return data.ConsumeIntegralInRange<unsigned>(0, static_cast<unsigned>(n) - 1);
  };
  unsigned count = 0;
  forEachFunction([&count](const auto&) { ++count; });
  while (data.remaining_bytes() > 0) {
    const unsigned chosen = choose(count);
    const unsigned seed = choose(65536);
    unsigned i = 0;
    forEachFunction([&](const auto& function) {
      if (i++ == chosen) checkRandomCall(function, choose, seed);
    });
  }
  return 0;
}
