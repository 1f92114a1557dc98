// zelta-wrap: what the picture input shows, the rules of each format for
// its frames, and the master metadata of the clip drawn from both and from
// the options.
#ifndef ZELTA_WRAP_CLIP_H
#define ZELTA_WRAP_CLIP_H

#include <cstdint>
#include <memory>
#include <string>

#include "kit.h"
#include "media_input.h"
#include "options.h"

namespace zelta_wrap {

// The picture input as one pass over it found it.
struct PictureFacts {
  std::uint64_t frameCount = 0;
  std::size_t smallestFrame = 0;
  std::size_t largestFrame = 0;
  // Of the parser's picture types, 0 when it gave none.
  std::uint16_t longestGOP = 0;
  std::uint16_t longestBRun = 0;
  bool identicalGOPs = true;
  // What the demuxer tells, when it read the input.
  MXFRational rate;
  int width = 0;
  int height = 0;
  AVFieldOrder fieldOrder = AV_FIELD_UNKNOWN;
  std::int64_t bitRate = 0;
  int profile = FF_PROFILE_UNKNOWN;
  int level = FF_LEVEL_UNKNOWN;
  AVPixelFormat pixelFormat = AV_PIX_FMT_NONE;
  AVRational displayAspectRatio{0, 1};
};

// Octets of a raw frame of the code at the display width; InputError for a
// code or width that the kit does not write.
std::size_t getRawFrameSize(std::uint16_t code, std::uint32_t width);

// The octets of the input's frames, for Raw the size of a frame (0 for the
// others).
std::size_t getChunkSize(const Options& options);

// InputError for an option value that the format refuses whatever the
// input.
void checkOptions(const Options& options);

// Reads the whole input once: frame count, sizes, GOP structure and the
// demuxer's values.
PictureFacts scanPicture(PictureInput& input);

// The values of the clip, every one decided.
struct Clip {
  ZeltaEssenceFormat format = ZeltaEssenceFormat::MPEG;
  MXFRational rate;
  std::uint32_t bitRate = 0;
  bool progressive = false;
  // A frame padded with zeros to this size, when not 0.
  std::size_t paddedFrameSize = 0;
  // The largest frame allowed, when not 0; the only size, when exact.
  std::size_t frameSizeLimit = 0;
  bool exactFrameSize = false;
  std::uint32_t soundChannels = 0;
  // Channels that the master declares: for D10 4 or 8.
  std::uint32_t declaredChannels = 0;
  std::uint32_t quantizationBits = 24;
};

// InputError for an option value that the format refuses, or frames that
// break its rules.
Clip decideClip(const Options& options, const PictureFacts& facts, std::uint32_t soundChannels);

// The clip's master; its duration is all ones while the progress says that
// the input goes on, when the options want an unknown duration.
struct Progress {
  std::uint64_t count = 0;
  bool ended = false;
};
std::shared_ptr<ZeltaMasterMetadata> createMaster(const Options& options, const Clip& clip, const PictureFacts& facts,
                                                  const std::shared_ptr<const Progress>& progress);

}  // namespace zelta_wrap

#endif
