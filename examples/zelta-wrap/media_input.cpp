#include "media_input.h"

#include <cerrno>
#include <cstring>

#include "options.h"

namespace zelta_wrap {

namespace {

// "cannot read PATH: why", in FFmpeg's words.
InputError unreadable(const std::string& path, int error) {
  char why[AV_ERROR_MAX_STRING_SIZE] = {};
  av_strerror(error, why, sizeof why);
  return InputError("cannot read " + path + ": " + why);
}

}  // namespace

MediaFile::MediaFile(const std::string& path, AVMediaType kind) : path_(path) {
  const int opened = avformat_open_input(&format_, path.c_str(), nullptr, nullptr);
  if (opened < 0) throw unreadable(path, opened);
  packet_ = av_packet_alloc();
  const int found = packet_ == nullptr ? AVERROR(ENOMEM) : avformat_find_stream_info(format_, nullptr);
  if (found < 0) {
    av_packet_free(&packet_);
    avformat_close_input(&format_);
    throw unreadable(path, found);
  }
  stream_ = av_find_best_stream(format_, kind, -1, -1, nullptr, 0);
  if (stream_ < 0) {
    av_packet_free(&packet_);
    avformat_close_input(&format_);
    throw InputError(path + " has no " + av_get_media_type_string(kind) + " stream");
  }
}

MediaFile::~MediaFile() {
  av_packet_free(&packet_);
  avformat_close_input(&format_);
}

bool MediaFile::readPacket() {
  for (;;) {
    av_packet_unref(packet_);
    const int result = av_read_frame(format_, packet_);
    if (result == AVERROR_EOF) return false;
    if (result < 0) throw unreadable(path_, result);
    if (packet_->stream_index == stream_) return true;
  }
}

PictureInput::PictureInput(const std::string& path, std::size_t chunkSize) : path_(path), chunkSize_(chunkSize) {
  if (chunkSize == 0) {
    media_ = std::make_unique<MediaFile>(path, AVMEDIA_TYPE_VIDEO);
    return;
  }
  raw_.open(path, std::ios::binary);
  if (!raw_) throw InputError("cannot read " + path + ": " + std::strerror(errno));
}

bool PictureInput::next(std::vector<std::uint8_t>& frame) {
  if (media_) {
    if (!media_->readPacket()) return false;
    const AVPacket& packet = media_->getPacket();
    frame.assign(packet.data, packet.data + packet.size);
    return true;
  }
  frame.resize(chunkSize_);
  raw_.read(reinterpret_cast<char*>(frame.data()), static_cast<std::streamsize>(chunkSize_));
  const auto got = static_cast<std::size_t>(raw_.gcount());
  if (got == 0 && raw_.eof()) return false;
  if (got != chunkSize_)
    throw InputError(path_ + " is not a whole number of frames of " + std::to_string(chunkSize_) + " octets");
  return true;
}

PictureTypes::PictureTypes(const AVCodecParameters& parameters) {
  parser_ = av_parser_init(parameters.codec_id);
  codec_ = avcodec_alloc_context3(nullptr);
  if (parser_ != nullptr) parser_->flags |= PARSER_FLAG_COMPLETE_FRAMES;
  if (codec_ != nullptr) avcodec_parameters_to_context(codec_, &parameters);
}

PictureTypes::~PictureTypes() {
  if (parser_ != nullptr) av_parser_close(parser_);
  avcodec_free_context(&codec_);
}

AVPictureType PictureTypes::of(const std::vector<std::uint8_t>& frame) {
  if (parser_ == nullptr || codec_ == nullptr) return AV_PICTURE_TYPE_NONE;
  std::uint8_t* out = nullptr;
  int outSize = 0;
  av_parser_parse2(parser_, codec_, &out, &outSize, frame.data(), static_cast<int>(frame.size()), AV_NOPTS_VALUE,
                   AV_NOPTS_VALUE, 0);
  return outSize > 0 ? static_cast<AVPictureType>(parser_->pict_type) : AV_PICTURE_TYPE_NONE;
}

}  // namespace zelta_wrap
