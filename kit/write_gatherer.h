// The kit writer's stream in front of the client's: keys, lengths and small
// values are gathered and reach the client's stream buffer in one write;
// large values go to it straight from the caller's memory. An edit unit of
// many small elements so costs the file few writes, whatever buffer the
// client gave its stream.
#ifndef ZELTA_KIT_WRITE_GATHERER_H
#define ZELTA_KIT_WRITE_GATHERER_H

#include <ostream>
#include <streambuf>
#include <vector>

namespace zelta {

class GatheringBuffer : public std::streambuf {
 public:
  // Not owned.
  explicit GatheringBuffer(std::streambuf* target);
  GatheringBuffer(const GatheringBuffer&) = delete;
  GatheringBuffer& operator=(const GatheringBuffer&) = delete;

 protected:
  std::streamsize xsputn(const char* data, std::streamsize size) override;
  int_type overflow(int_type octet) override;
  // What is gathered goes out, and the client's buffer is synchronised.
  int sync() override;

 private:
  bool sendGathered();

  std::streambuf* target_;
  std::vector<char> gathered_;
};

// An output stream over a GatheringBuffer, with the client's fill item key
// version.
class GatheringStream : public std::ostream {
 public:
  explicit GatheringStream(std::ostream& target);
  // Sends what is left; a failure then is the client's stream's to show.
  ~GatheringStream() override;

 private:
  GatheringBuffer buffer_;
};

}  // namespace zelta

#endif
