#include <kelcore/config/DeferredErrorReporter.h>
#include <kelcore/config/ErrorManager.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include <limits>
#include <new>

namespace kelcore::config {
namespace {

// The library's text for a reporter that cannot be allocated.
class BadAllocation : public std::bad_alloc {
 public:
  const char* what() const noexcept override { return "bad allocation"; }
};

}  // namespace

DeferredErrorReporter::DeferredErrorReporter(bool reportWhenFinished)
    : reportWhenFinished_(reportWhenFinished) {
  ErrorManager::Get(false)->AddDeferredErrorReporter(this);
}

DeferredErrorReporter::~DeferredErrorReporter() {
  if (manager_ != nullptr) manager_->RemoveDeferredErrorReporter(this);
}

void DeferredErrorReporter::Finish() {
  ++finishCount_;
  if (!reportWhenFinished_ || errorCount_ == 0) return;
  errorCount_ = 0;
  ErrorManager::Get(false)->DoThrowError(level_, key_.c_str(), component_, errorNumber_, true,
                                         values_[0], values_[1], values_[2], values_[3]);
}

const ReplacementValue& DeferredErrorReporter::GetValue(std::size_t index) const {
  static const ReplacementValue none;
  return index < 4 ? values_[index] : none;
}

void* DeferredErrorReporter::operator new(std::size_t size) {
  try {
    if (size > std::numeric_limits<unsigned int>::max()) throw std::bad_alloc();
    return utility::SmallBlockAllocator::Allocate(static_cast<unsigned int>(size));
  } catch (const std::bad_alloc&) {
    throw BadAllocation();
  }
}

void DeferredErrorReporter::operator delete(void* block, std::size_t size) noexcept {
  utility::SmallBlockAllocator::Dispose(block, static_cast<unsigned int>(size));
}

}  // namespace kelcore::config
