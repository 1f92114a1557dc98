#include "kit/write_gatherer.h"

#include <cstring>

#include "klv.h"

namespace zelta {

namespace {

// Values from this size on are not gathered.
constexpr std::streamsize directOctets = std::streamsize(1) << 16;
constexpr std::size_t gatheredOctets = std::size_t(1) << 18;

}  // namespace

GatheringBuffer::GatheringBuffer(std::streambuf* target) : target_(target), gathered_(gatheredOctets) {
  setp(gathered_.data(), gathered_.data() + gathered_.size());
}

bool GatheringBuffer::sendGathered() {
  const std::streamsize size = pptr() - pbase();
  if (size == 0) return true;
  const bool sent = target_->sputn(pbase(), size) == size;
  setp(gathered_.data(), gathered_.data() + gathered_.size());
  return sent;
}

std::streamsize GatheringBuffer::xsputn(const char* data, std::streamsize size) {
  if (size > epptr() - pptr() || size >= directOctets) {
    if (!sendGathered()) return 0;
    if (size >= directOctets) return target_->sputn(data, size);
  }
  std::memcpy(pptr(), data, static_cast<std::size_t>(size));
  pbump(static_cast<int>(size));
  return size;
}

GatheringBuffer::int_type GatheringBuffer::overflow(int_type octet) {
  if (!sendGathered()) return traits_type::eof();
  if (traits_type::eq_int_type(octet, traits_type::eof())) return traits_type::not_eof(octet);
  *pptr() = traits_type::to_char_type(octet);
  pbump(1);
  return octet;
}

int GatheringBuffer::sync() { return sendGathered() && target_->pubsync() == 0 ? 0 : -1; }

GatheringStream::GatheringStream(std::ostream& target) : std::ostream(nullptr), buffer_(target.rdbuf()) {
  rdbuf(&buffer_);
  setFillItemKeyVersion(*this, getFillItemKeyVersion(target));
}

GatheringStream::~GatheringStream() { buffer_.pubsync(); }

}  // namespace zelta
