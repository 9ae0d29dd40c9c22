// Runs steps in an interpreter with the package, as a script does, beside a model of what they are
// to answer.
#ifndef VORKEL_TESTS_MODEL_SESSION_H_
#define VORKEL_TESTS_MODEL_SESSION_H_

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "tests/model/World.h"

namespace model {

using NewWorld = std::function<std::unique_ptr<World>()>;

// Where an answer is not the model's.
struct Difference {
  std::size_t step = 0;  // of those that were run
  std::string line;
  std::string text;  // in words
};

class Session {
 public:
  explicit Session(std::unique_ptr<World> world);
  ~Session();
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  const World& world() const { return *world_; }

  // Runs the step; what is wrong with its answer, or nothing.
  std::optional<Difference> Run(const Step& step);

 private:
  struct Interpreter;

  std::unique_ptr<World> world_;
  std::unique_ptr<Interpreter> interpreter_;
  std::size_t steps_ = 0;
};

// The first difference of steps in a session of their own. Steps of which the plain search goes far
// are passed over unless `far` is set.
std::optional<Difference> Play(const Steps& steps, const NewWorld& new_world, bool far = false);

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_SESSION_H_
