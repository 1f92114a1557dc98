// zelta-wrap: inputs read through libavformat, one packet at a time, so
// that memory does not grow with the input's length.
#ifndef ZELTA_WRAP_MEDIA_INPUT_H
#define ZELTA_WRAP_MEDIA_INPUT_H

#include <cstdint>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
}

namespace zelta_wrap {

// One stream of a file opened by libavformat; InputError when the file
// can't be opened or has no stream of the kind.
class MediaFile {
 public:
  MediaFile(const std::string& path, AVMediaType kind);
  ~MediaFile();
  MediaFile(const MediaFile&) = delete;
  MediaFile& operator=(const MediaFile&) = delete;

  const AVStream& getStream() const { return *format_->streams[stream_]; }
  const AVCodecParameters& getParameters() const { return *getStream().codecpar; }
  // The next packet of the stream, in place of the last; false at the end.
  bool readPacket();
  const AVPacket& getPacket() const { return *packet_; }

 private:
  std::string path_;
  AVFormatContext* format_ = nullptr;
  AVPacket* packet_ = nullptr;
  int stream_ = -1;
};

// The picture stream frame by frame: packets of libavformat, or chunks of a
// fixed size when the input is raw frames laid end to end.
class PictureInput {
 public:
  // A chunk size of 0 demuxes the file.
  PictureInput(const std::string& path, std::size_t chunkSize);

  // The next frame in place of the last; false at the end. InputError for a
  // raw input that ends within a frame.
  bool next(std::vector<std::uint8_t>& frame);
  // Null for raw frames.
  const MediaFile* getMedia() const { return media_.get(); }

 private:
  std::string path_;
  std::size_t chunkSize_;
  std::unique_ptr<MediaFile> media_;
  std::ifstream raw_;
};

// The coding type of each frame of MPEG-2, MPEG-4 or AVC, through
// libavcodec's parser.
class PictureTypes {
 public:
  explicit PictureTypes(const AVCodecParameters& parameters);
  ~PictureTypes();
  PictureTypes(const PictureTypes&) = delete;
  PictureTypes& operator=(const PictureTypes&) = delete;

  // AV_PICTURE_TYPE_I, _P, _B, or _NONE when the parser knows none.
  AVPictureType of(const std::vector<std::uint8_t>& frame);

 private:
  AVCodecParserContext* parser_ = nullptr;
  AVCodecContext* codec_ = nullptr;
};

}  // namespace zelta_wrap

#endif
