// The splitter's own memory for essence values.
#ifndef ZELTA_ESSENCE_GC_OWN_BUFFER_H
#define ZELTA_ESSENCE_GC_OWN_BUFFER_H

#include <cstdint>
#include <ios>
#include <memory>

// Grows to exactly the size asked for and never shrinks; the filled octets
// survive growth. Nothing is zero-filled, since values are read over it.
class MXFGCOwnBuffer {
public:
  std::uint8_t* data() const { return data_.get(); }
  std::uint64_t capacity() const { return capacity_; }
  std::uint64_t fill() const { return fill_; }
  void clear() { fill_ = 0; }
  // "successful allocation"
  void reserve(std::uint64_t size);
  // Octets that a reader has put in place are only counted ("valid essence
  // buffer size"); others are appended ("valid range to append").
  void append(const std::uint8_t* data, std::streamsize size);

private:
  std::unique_ptr<std::uint8_t[]> data_;
  std::uint64_t capacity_ = 0;
  std::uint64_t fill_ = 0;
};

#endif
