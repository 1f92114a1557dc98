// zelta-wrap: the driver's source, one edit unit in memory at a time: the
// next frame of the picture input and the samples of every channel for it.
#ifndef ZELTA_WRAP_SOURCE_H
#define ZELTA_WRAP_SOURCE_H

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "clip.h"
#include "kit.h"
#include "media_input.h"
#include "options.h"
#include "sound_input.h"

namespace zelta_wrap {

class WrapSource : public ZeltaSource {
 public:
  // Reads the picture and the sound files from their starts; each edit unit
  // calls the progress reporter with the count of edit units read.
  WrapSource(const Options& options, const Clip& clip, std::shared_ptr<ZeltaMasterMetadata> master,
             std::shared_ptr<Progress> progress, std::function<void(std::uint64_t)> reportProgress);

  std::shared_ptr<const ZeltaMasterMetadata> getMasterMetadata() override { return master_; }
  std::shared_ptr<MXFUIDGenerator> getUIDGenerator() override { return nullptr; }
  bool hasPictureMetadata() override { return false; }
  bool isIndexDeferred() override { return false; }
  std::uint32_t getAVCWrapping() override;

  // Moves on to the next edit unit; false when the picture has ended.
  bool hasMoreEditUnits() override;
  MXFSDTICPTimeStamp getUserStamp() override { return MXFSDTICPTimeStamp{}; }
  MXFGCLocalItems getPackageMetadata() override { return {}; }
  MXFGCLocalItems getPictureMetadata() override { return {}; }
  std::shared_ptr<ZeltaBuffer> getD10Picture() override { return lend(frame_); }
  std::shared_ptr<ZeltaBuffer> getD10Sound() override { return lend(d10Sound_); }
  std::shared_ptr<ZeltaBuffer> getDVElement() override { return lend(frame_); }
  std::shared_ptr<ZeltaBuffer> getMPEGPicture() override { return lend(frame_); }
  std::shared_ptr<ZeltaBuffer> getRawPicture() override { return lend(frame_); }
  std::shared_ptr<ZeltaBuffer> getAVCPicture() override { return lend(frame_); }
  std::shared_ptr<ZeltaBuffer> getSound(std::uint32_t channel) override;
  std::shared_ptr<ZeltaBuffer> getAncillaryData() override { return nullptr; }

 private:
  static std::shared_ptr<ZeltaBuffer> lend(const std::vector<std::uint8_t>& octets);
  void readSound();

  const Clip clip_;
  bool constantAVC_;
  std::shared_ptr<ZeltaMasterMetadata> master_;
  std::shared_ptr<Progress> progress_;
  std::function<void(std::uint64_t)> reportProgress_;
  PictureInput picture_;
  std::vector<std::unique_ptr<SoundInput>> sounds_;
  bool started_ = false;
  std::uint64_t editUnit_ = 0;
  std::vector<std::uint8_t> frame_;
  // Every channel of every file, in order.
  std::vector<std::vector<std::uint8_t>> channels_;
  std::vector<std::uint8_t> d10Sound_;
  std::vector<std::vector<std::uint8_t>> fileChannels_;
};

}  // namespace zelta_wrap

#endif
