// What the read benchmarks share: a large temporary file that lives as long
// as the process, the plain read() loop that they are measured against, and
// the throughput counters.
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

// Writes a file under the temporary directory once per process, by the
// writer given; the file is removed at exit.
inline std::string writeBenchFile(const std::string& name, const std::function<void(std::ostream&)>& write) {
  const std::filesystem::path named(name);
  const std::string unique = named.stem().string() + "_" + std::to_string(::getpid()) + named.extension().string();
  const std::string path = (std::filesystem::temp_directory_path() / unique).string();
  if (benchFilePaths().empty()) std::atexit(removeBenchFiles);
  benchFilePaths().push_back(path);
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

// Opens the file with a stream buffer of the client's, or of the file
// stream's own when the buffer is empty. A small one leaves the stream only
// keys and lengths to read ahead, so that every value goes from the kernel
// straight into the handler's buffer in one read() call.
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

// The yardstick: read() of the whole file in 1 MiB pieces, in the same run
// as the reader that is measured against it.
inline void plainReadLoop(benchmark::State& state, const std::string& path, std::uint64_t fileOctets,
                          std::uint64_t elementOctets) {
  std::vector<char> buffer(plainBufferOctets);
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

}  // namespace zelta_bench

#endif
