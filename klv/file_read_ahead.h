// A file stream's file, read around the stream's own buffer.
#ifndef ZELTA_KLV_FILE_READ_AHEAD_H
#define ZELTA_KLV_FILE_READ_AHEAD_H

#include <cstddef>
#include <istream>
#include <memory>
#include <streambuf>

namespace zelta::klv {

// Reads a file by position through its descriptor. A std::filebuf reads a
// value straight into the caller's memory only when the value is larger
// than the buffer that the client gave it, and every seek throws that buffer
// away; this buffer makes the speed of a read independent of both. Keys,
// lengths and small values come out of a read-ahead whose pieces start small
// and grow while the elements stay small; the rest of a large value goes
// straight into the caller's memory, in the same system call that brings the
// next piece of read-ahead; a seek is arithmetic until the next read.
class FileReadAhead : public std::streambuf {
public:
  FileReadAhead(int descriptor, std::streamoff position);

  // Where the reader stands in the file.
  std::streamoff position() const { return next_ - (egptr() - gptr()); }

protected:
  int_type underflow() override;
  std::streamsize xsgetn(char_type* s, std::streamsize n) override;
  pos_type seekoff(off_type off, std::ios_base::seekdir dir, std::ios_base::openmode which) override;
  pos_type seekpos(pos_type pos, std::ios_base::openmode which) override;

private:
  std::streamsize copyOut(char_type* s, std::streamsize n);
  std::streamsize readDirect(char_type* s, std::streamsize held, std::streamsize n);
  // Forgets what the read-ahead holds.
  void drop() { setg(buffer_.get(), buffer_.get(), buffer_.get()); }

  int descriptor_;
  std::streamoff next_;      // the file offset of the octet behind the get area
  std::streamoff runStart_;  // where the elements since the last large value or jump began
  std::size_t piece_;        // the size of the next read-ahead
  std::unique_ptr<char_type[]> buffer_;
};

// For the length of one read, a file stream reads through a FileReadAhead of
// its file, so that the client's own stream still answers where the read
// stands. At the end the stream has its own buffer back, standing where the
// read stopped, with the state that the read left. Any other stream is left
// as it is.
class ReadAheadScope {
public:
  explicit ReadAheadScope(std::istream& stream);
  ReadAheadScope(const ReadAheadScope&) = delete;
  ReadAheadScope& operator=(const ReadAheadScope&) = delete;
  ~ReadAheadScope();

private:
  std::istream& stream_;
  std::streambuf* own_ = nullptr;
  std::unique_ptr<FileReadAhead> readAhead_;
};

}  // namespace zelta::klv

#endif
