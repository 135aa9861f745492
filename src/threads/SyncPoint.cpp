#include <kelcore/threads/SyncPoint.h>

#include <boost/make_shared.hpp>

#include <condition_variable>
#include <cstdint>
#include <mutex>
#include <system_error>

namespace kelcore::threads {
namespace {

// The system error code for an invalid argument, as the library numbers system errors.
constexpr int kInvalidArgument = 22;

// A standard system error whose text is exactly the barrier's message.
class BarrierCountError : public std::system_error {
 public:
  BarrierCountError()
      : std::system_error(kInvalidArgument, std::generic_category(),
                          "barrier constructor: count cannot be zero.") {}
  const char* what() const noexcept override {
    return "barrier constructor: count cannot be zero.";
  }
};

}  // namespace

struct SyncPoint::Barrier {
  explicit Barrier(unsigned int count) : threshold(count), awaited(count) {}

  std::mutex mutex;
  std::condition_variable woken;
  const unsigned int threshold;
  unsigned int awaited;
  std::uint64_t generation = 0;
};

SyncPoint::SyncPoint(unsigned int count) {
  if (count == 0) throw BarrierCountError();
  barrier_ = boost::make_shared<Barrier>(count);
}

SyncPoint::SyncPoint(const SyncPoint& other) = default;

SyncPoint& SyncPoint::operator=(const SyncPoint& other) = default;

SyncPoint::~SyncPoint() = default;

bool SyncPoint::Wait() {
  const boost::shared_ptr<Barrier> barrier = barrier_;  // outlives other copies' release
  std::unique_lock<std::mutex> lock(barrier->mutex);
  const std::uint64_t generation = barrier->generation;
  if (--barrier->awaited == 0) {
    ++barrier->generation;
    barrier->awaited = barrier->threshold;
    barrier->woken.notify_all();
    return true;
  }
  barrier->woken.wait(lock, [&] { return barrier->generation != generation; });
  return false;
}

}  // namespace kelcore::threads
