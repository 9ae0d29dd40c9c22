// Where a benchmark writes its table.
#ifndef VORKEL_BENCH_TABLEFILE_H_
#define VORKEL_BENCH_TABLEFILE_H_

#include <cstdio>

namespace bench {

// The file that the first argument of a program names; standard output where there is none. Null
// when it cannot be opened.
inline std::FILE* TableFile(int argc, char** argv) {
  return argc > 1 ? std::fopen(argv[1], "w") : stdout;
}

}  // namespace bench

#endif  // VORKEL_BENCH_TABLEFILE_H_
