// The console's serial port on the board: UART0 of the nRF51822, which the micro:bit's interface
// chip passes on over USB, at 115200 baud, 8 data bits, no parity, one stop bit. Standard input and
// output are this port, and the end of the program resets the board, as a device starts again.
#include <stdint.h>
#include <stdio.h>

namespace {

enum : uintptr_t {
  CLOCK_HFCLKSTART = 0x40000000,
  CLOCK_HFCLKSTARTED = 0x40000100,
  UART_STARTRX = 0x40002000,
  UART_STARTTX = 0x40002008,
  UART_RXDRDY = 0x40002108,
  UART_TXDRDY = 0x4000211C,
  UART_ENABLE = 0x40002500,
  UART_PSELTXD = 0x4000250C,
  UART_PSELRXD = 0x40002514,
  UART_RXD = 0x40002518,
  UART_TXD = 0x4000251C,
  UART_BAUDRATE = 0x40002524,
  GPIO_OUTSET = 0x50000508,
  GPIO_DIRSET = 0x50000518,
  GPIO_PIN_CNF = 0x50000700,
  SYST_CSR = 0xE000E010,
  SYST_RVR = 0xE000E014,
  SCB_AIRCR = 0xE000ED0C,
};

volatile uint32_t& at(uintptr_t address) { return *reinterpret_cast<volatile uint32_t*>(address); }

void waitFor(uintptr_t event) {
  while (at(event) == 0) {
  }
}

int send(char c, FILE* port) {
  if (c == '\n') send('\r', port);
  at(UART_TXDRDY) = 0;
  at(UART_TXD) = static_cast<uint8_t>(c);
  waitFor(UART_TXDRDY);
  return static_cast<uint8_t>(c);
}

// The event is cleared before the byte is taken: the next byte may set it at once.
int receive(FILE*) {
  waitFor(UART_RXDRDY);
  at(UART_RXDRDY) = 0;
  return static_cast<uint8_t>(at(UART_RXD));
}

FILE port = FDEV_SETUP_STREAM(send, receive, nullptr, _FDEV_SETUP_RW);

// Only the crystal keeps time well enough for this rate. The pin is high before it is driven.
[[gnu::constructor]] void start() {
  constexpr uint32_t txd = 24;
  constexpr uint32_t rxd = 25;
  at(CLOCK_HFCLKSTART) = 1;
  waitFor(CLOCK_HFCLKSTARTED);
  at(GPIO_OUTSET) = 1U << txd;
  at(GPIO_DIRSET) = 1U << txd;
  at(GPIO_PIN_CNF + (4 * rxd)) = 0;  // an input
  at(UART_PSELTXD) = txd;
  at(UART_PSELRXD) = rxd;
  at(UART_BAUDRATE) = 0x01D7E000;  // 115200
  at(UART_ENABLE) = 4;
  at(UART_STARTTX) = 1;
  at(UART_STARTRX) = 1;
  // QEMU looks for input when it next has something to do, such as a timer.
  at(SYST_RVR) = 0xFFFFFF;
  at(SYST_CSR) = 1;
}

}  // namespace

FILE* const stdin = &port;
FILE* const stdout = &port;
FILE* const stderr = &port;

extern "C" [[noreturn]] void _exit(int) {
  at(SCB_AIRCR) = 0x05FA0004;  // requests a reset
  for (;;) {
  }
}
