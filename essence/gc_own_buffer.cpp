#include "essence/gc_own_buffer.h"

#include <cstring>
#include <new>

#include "klv.h"

namespace {

// No process of the platform can address more; asking the allocator for it
// would only make it complain.
constexpr std::uint64_t largestAllocation = std::uint64_t(1) << 47;

}  // namespace

void MXFGCOwnBuffer::reserve(std::uint64_t size) {
  if (size <= capacity_) return;
  check(size <= largestAllocation, "successful allocation");
  std::unique_ptr<std::uint8_t[]> grown(new (std::nothrow) std::uint8_t[size]);
  check(grown != nullptr, "successful allocation");
  if (fill_ != 0) std::memcpy(grown.get(), data_.get(), fill_);
  data_ = std::move(grown);
  capacity_ = size;
}

void MXFGCOwnBuffer::append(const std::uint8_t* data, std::streamsize size) {
  if (data == data_.get() + fill_) {
    check(size >= 0 && static_cast<std::uint64_t>(size) <= capacity_ - fill_, "valid essence buffer size");
    fill_ += static_cast<std::uint64_t>(size);
    return;
  }
  if (size == 0) return;
  check(size > 0, "valid range to append");
  reserve(fill_ + static_cast<std::uint64_t>(size));
  std::memmove(data_.get() + fill_, data, static_cast<std::size_t>(size));
  fill_ += static_cast<std::uint64_t>(size);
}
