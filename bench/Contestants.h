// The two that are timed, the product and the plain search, under one interface: each answers a
// request that the tests' generator can draw or that requests.h names.
#ifndef VORKEL_BENCH_CONTESTANTS_H_
#define VORKEL_BENCH_CONTESTANTS_H_

#include <cstddef>

#include "engine/Ip_VorkelImp.h"
#include "tests/plain/plain_pll.h"

namespace bench {

// What an answer says about the search that found it.
struct Outcome {
  int code = 0;        // of the plain search; 1 solved, 5 nothing serves the request
  double fudge = 0.0;  // MHz, without its sign; 0 when nothing was found
};

// The product, on the device whose speed data compare::PublishLimits sets.
class Product {
 public:
  Product();

  // One whole call, as the script binding makes it: text lists in, the speed data read anew.
  int Run(const plain::PllRequest& request, bool traced = false);

  // What the last call, which had this result code and request, has found.
  Outcome Found(int code) const;

 private:
  Ip::VorkelImp imp_;
};

// The plain search. It takes its limits as they are and reads no speed data.
class Plain {
 public:
  explicit Plain(const plain::PllLimits& limits) : limits_(limits) {}

  int Run(const plain::PllRequest& request);
  // The same with a trace; stores how many characters it has.
  int RunTraced(const plain::PllRequest& request, std::size_t* characters);

  Outcome Found() const { return {answer_.code, answer_.fudge}; }

 private:
  plain::PllLimits limits_;
  plain::RequestLists lists_;
  plain::PllAnswer answer_;
};

}  // namespace bench

#endif  // VORKEL_BENCH_CONTESTANTS_H_
