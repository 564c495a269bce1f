#pragma once

#include <cstdint>

// Wall-clock time in nanoseconds (CLOCK_REALTIME), for elapsed-time log lines.
uint64_t get_nanotime();
