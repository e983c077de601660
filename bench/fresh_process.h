// Measurements that need a process of their own, in which nothing has used memory before: this
// program starts itself for each of them.
#pragma once

#include "common.h"

namespace bench {

struct Measured {
  double seconds;
  double operations;
  double bytes = 0;  // that the process grew by; 0: not measured
};

// Registers a benchmark that takes its figure from `measure`, called with n in a new process.
void add_fresh(const char* workload, const char* contestant, Measured (*measure)(std::int64_t n),
               const std::vector<std::int64_t>& sizes = kSizes);

// The memory that this process has from the system at present, in bytes.
double resident_bytes();

}  // namespace bench
