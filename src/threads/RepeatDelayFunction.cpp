#include <kelcore/threads/RepeatDelayFunction.h>

#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

namespace kelcore::threads {
namespace {

// One scheduled call; it schedules a copy of itself while the function asks for more.
struct RepeatStep {
  void operator()() const {
    if (!fn()) return;
    if (const boost::shared_ptr<AsyncExecutor> strong = executor.lock()) {
      strong->CallAsynchronously(*this, delayMilliseconds);
    }
  }

  boost::weak_ptr<AsyncExecutor> executor;
  boost::function<bool()> fn;
  unsigned int delayMilliseconds;
};

}  // namespace

void CallConditionalRepeatDelayFunctionAsynchronously(
    const boost::shared_ptr<AsyncExecutor>& executor, const boost::function<bool()>& fn,
    unsigned int delayMilliseconds) {
  if (!executor || fn.empty()) return;
  executor->CallAsynchronously(RepeatStep{executor, fn, delayMilliseconds}, delayMilliseconds);
}

RepeatDelayFunction::RepeatDelayFunction(const boost::shared_ptr<AsyncExecutor>& executor,
                                         const boost::function<void()>& fn,
                                         unsigned int delayMilliseconds) {
  if (!executor || fn.empty()) return;
  state_ = boost::make_shared<boost::function<void()>>(fn);
  const boost::weak_ptr<boost::function<void()>> weakState = state_;
  CallConditionalRepeatDelayFunctionAsynchronously(
      executor,
      [weakState] {
        // The strong reference keeps the function alive for a call that overlaps
        // DoNotCallAgain.
        const boost::shared_ptr<boost::function<void()>> state = weakState.lock();
        if (!state) return false;
        (*state)();
        return true;
      },
      delayMilliseconds);
}

RepeatDelayFunction::~RepeatDelayFunction() = default;

void RepeatDelayFunction::DoNotCallAgain() {
  state_.reset();
}

}  // namespace kelcore::threads
