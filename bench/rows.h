// What is measured: calls of every function, the same for all who can do them.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

using Units = std::u16string;

// A buffer that a call gets, and what of it may be read before it is written.
struct Buffer {
  uint32_t unitSize;
  Units units;
};

// An argument: a number, or the address of one of the call's buffers.
struct Argument {
  int value;
  bool isBuffer = true;
};

// A call, and what must come of it.
struct Call {
  enum Kind { ignored, number, sign, index };  // of result: sign only of a library's comparison

  std::vector<Buffer> memory;
  std::vector<Argument> arguments;
  std::vector<Argument> peerArguments = arguments;  // what a C library takes,
  std::vector<Argument> peerNext = arguments;       // and from the second call on
  Kind kind = ignored;
  int result = 0;
  size_t written = 0;  // the buffer that is written,
  Units after{};       // and what it starts with then
  bool untilNull = false;

  Call& returns(int value, Kind as = number) { return kind = as, result = value, *this; }
  Call& finds(int place) { return returns(place, index); }  // in buffer 0, -1 for null
  Call& writes(size_t buffer, const Units& units) { return written = buffer, after = units, *this; }
  Call& peerTakes(const std::vector<Argument>& first) { return peerTakes(first, first); }
  Call& peerTakes(const std::vector<Argument>& first, const std::vector<Argument>& next) {
    return peerArguments = first, peerNext = next, *this;
  }
  Call& isRepeatedUntilNull() { return untilNull = true, *this; }
};

struct Row {
  std::string name;    // of the function
  std::string about;   // which of its cases, if it has several
  std::string symbol;  // under which the library and the loops have it
  std::string peer;    // under which the C libraries have it, if they do
  bool isLimited;      // the hand-written limit has it, under its name
  std::vector<int> sizes;
  std::function<Call(int size)> call;

  std::string title() const { return "`" + name + "`" + about; }
};

// All rows, narrow or wide by the size of a unit.
std::vector<Row> rowsFor(uint32_t unit);
