// Where a benchmark writes its table.
#ifndef VORKEL_BENCH_TABLEFILE_H_
#define VORKEL_BENCH_TABLEFILE_H_

#include <cstdio>

namespace bench {

// The file that the first of a program's arguments names, of which it takes `most`; standard output
// where there is none. Null when there are more, and when the file cannot be opened.
inline std::FILE* TableFile(int argc, char** argv, int most) {
  if (argc - 1 > most) return nullptr;
  return argc > 1 ? std::fopen(argv[1], "w") : stdout;
}

}  // namespace bench

#endif  // VORKEL_BENCH_TABLEFILE_H_
