// What the measuring programs share: clocks, counters and the middle of several runs.
#pragma once

#include <sys/time.h>

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

namespace qel::benchmarks {

using Clock = std::chrono::steady_clock;
using Microseconds = std::chrono::duration<double, std::micro>;
using Milliseconds = std::chrono::duration<double, std::milli>;

std::chrono::microseconds timeOf(const timeval& time);

// Processor time of this process so far, all threads.
std::chrono::nanoseconds processorTime();

// How often the threads of this process have been woken, as the kernel counts it.
std::uint64_t wakeUps();

double median(std::vector<double> values);
// `share` from 0 to 1.
double percentile(std::vector<double> values, double share);

// One row of the table: what, this project, beside it, what is to be reached.
void printRow(const std::string& what, const std::string& here, const std::string& beside,
              const std::string& reach);
// Such as "0.53 ms".
std::string text(double value, const char* unit, int digits = 2);

}  // namespace qel::benchmarks
