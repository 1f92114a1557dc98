// What the read benchmarks share: large temporary files that live as long
// as the process, the plain read() loop and the pread() walk of keys and
// lengths that they are measured against, and the throughput counters.
#ifndef ZELTA_BENCH_BENCH_FILES_H
#define ZELTA_BENCH_BENCH_FILES_H

#include <benchmark/benchmark.h>

#include <fcntl.h>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "klv.h"

namespace zelta_bench {

// At least this much, so that the page cache, not the CPU caches, feeds the
// reads.
inline constexpr std::uint64_t leastFileOctets = std::uint64_t(1) << 30;

// The size of the reads of the plain loop.
inline constexpr std::size_t plainBufferOctets = std::size_t(1) << 20;

inline std::vector<std::string>& benchFilePaths() {
  static std::vector<std::string> paths;
  return paths;
}

inline void removeBenchFiles() {
  for (const std::string& path : benchFilePaths()) std::remove(path.c_str());
}

// A path under the temporary directory for a file of this process, which
// is removed at exit.
inline std::string benchFilePath(const std::string& name) {
  const std::filesystem::path named(name);
  const std::string unique = named.stem().string() + "_" + std::to_string(::getpid()) + named.extension().string();
  const std::string path = (std::filesystem::temp_directory_path() / unique).string();
  if (benchFilePaths().empty()) std::atexit(removeBenchFiles);
  benchFilePaths().push_back(path);
  return path;
}

// Writes a file under the temporary directory once per process, by the
// writer given; the file is removed at exit.
inline std::string writeBenchFile(const std::string& name, const std::function<void(std::ostream&)>& write) {
  const std::string path = benchFilePath(name);
  std::ofstream out(path, std::ios::binary);
  write(out);
  out.close();
  check(!out.fail(), "bench file written");
  return path;
}

// Buffers that a handler hands out in turn, as a decoder keeps a few frames
// in flight; each grows to the largest length asked of it.
class BufferPool {
public:
  explicit BufferPool(std::size_t count) : buffers_(count) {}
  bool empty() const { return buffers_.empty(); }
  std::uint8_t* next(std::uint64_t length) {
    std::vector<std::uint8_t>& buffer = buffers_[next_++ % buffers_.size()];
    if (buffer.size() < length) buffer.resize(length);
    return buffer.data();
  }

private:
  std::vector<std::vector<std::uint8_t>> buffers_;
  std::size_t next_ = 0;
};

// Opens the file as a client does: with a stream buffer of its own set
// before open, or, when the buffer is empty, with the file stream's own.
inline void openWithStreamBuffer(std::ifstream& in, const std::string& path, std::vector<char>& streamBuffer) {
  if (!streamBuffer.empty())
    in.rdbuf()->pubsetbuf(streamBuffer.data(), static_cast<std::streamsize>(streamBuffer.size()));
  in.open(path, std::ios::binary);
  check(in.is_open(), "bench file opened");
}

inline void reportThroughput(benchmark::State& state, std::uint64_t octets, std::uint64_t elements) {
  state.SetBytesProcessed(static_cast<std::int64_t>(octets));
  state.counters["elements"] = benchmark::Counter(static_cast<double>(elements), benchmark::Counter::kIsRate);
}

// The yardstick: read() of the whole file in pieces of 1 MiB, or of the
// size given, into one buffer, in the same run as the reader that is
// measured against it.
inline void plainReadLoop(benchmark::State& state, const std::string& path, std::uint64_t fileOctets,
                          std::uint64_t elementOctets, std::size_t bufferOctets = plainBufferOctets) {
  std::vector<char> buffer(bufferOctets);
  std::uint64_t octets = 0;
  for (auto _ : state) {
    const int fd = ::open(path.c_str(), O_RDONLY);
    check(fd >= 0, "bench file opened");
    std::uint64_t total = 0;
    for (ssize_t n; (n = ::read(fd, buffer.data(), buffer.size())) > 0;) total += static_cast<std::uint64_t>(n);
    ::close(fd);
    check(total == fileOctets, "whole bench file read");
    benchmark::DoNotOptimize(buffer.data());
    octets += total;
  }
  reportThroughput(state, octets, octets / elementOctets);
}

// The yardstick of a walk that skips values: pread() of each top-level
// key and BER length, and a jump over the value, to the end of the file.
inline void preadWalk(benchmark::State& state, const std::string& path, std::uint64_t fileOctets,
                      std::uint64_t elementOctets) {
  constexpr std::size_t prefixOctets = 16 + 9;
  std::uint8_t prefix[prefixOctets];
  std::uint64_t octets = 0;
  for (auto _ : state) {
    const int fd = ::open(path.c_str(), O_RDONLY);
    check(fd >= 0, "bench file opened");
    std::uint64_t at = 0;
    for (ssize_t n; (n = ::pread(fd, prefix, prefixOctets, static_cast<off_t>(at))) > 16;) {
      const std::uint8_t first = prefix[16];
      const unsigned lengthOctets = (first & 0x80) ? (first & 0x7Fu) : 0u;
      std::uint64_t length = (first & 0x80) ? 0 : first;
      for (unsigned i = 0; i < lengthOctets; ++i) length = (length << 8) | prefix[17 + i];
      at += 17 + lengthOctets + length;
    }
    ::close(fd);
    check(at == fileOctets, "whole bench file walked");
    octets += at;
  }
  reportThroughput(state, octets, octets / elementOctets);
}

}  // namespace zelta_bench

#endif
