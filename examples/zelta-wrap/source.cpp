#include "source.h"

#include <utility>

#include "sound_layout.h"

namespace zelta_wrap {

namespace {

// Octets that stay the source's while the driver copies them.
class LentBuffer : public ZeltaBuffer {
 public:
  explicit LentBuffer(const std::vector<std::uint8_t>& octets) : octets_(octets) {}
  const std::uint8_t* getData() const override { return octets_.data(); }
  std::size_t getSize() const override { return octets_.size(); }

 private:
  const std::vector<std::uint8_t>& octets_;
};

const std::vector<std::uint8_t> noOctets;

}  // namespace

WrapSource::WrapSource(const Options& options, const Clip& clip, std::shared_ptr<ZeltaMasterMetadata> master,
                       std::shared_ptr<Progress> progress, std::function<void(std::uint64_t)> reportProgress)
    : clip_(clip),
      constantAVC_(options.avcWrapping == AVCWrapping::constant),
      master_(std::move(master)),
      progress_(std::move(progress)),
      reportProgress_(std::move(reportProgress)),
      picture_(options.picture, getChunkSize(options)) {
  for (const std::string& path : options.sounds)
    sounds_.push_back(std::make_unique<SoundInput>(path, options.quantizationBits));
}

std::uint32_t WrapSource::getAVCWrapping() { return constantAVC_ ? 1 : 0; }

bool WrapSource::hasMoreEditUnits() {
  if (progress_->ended) return false;
  if (started_) ++editUnit_;
  started_ = true;
  if (!picture_.next(frame_)) {
    progress_->count = editUnit_;
    progress_->ended = true;
    return false;
  }
  if (clip_.paddedFrameSize > frame_.size()) frame_.resize(clip_.paddedFrameSize, 0);
  readSound();
  reportProgress_(editUnit_ + 1);
  return true;
}

void WrapSource::readSound() {
  const bool d10 = clip_.format == ZeltaEssenceFormat::D10;
  std::uint32_t count = getSampleCount(clip_.rate, editUnit_);
  std::uint32_t sequence = 0;
  if (d10) {
    // The D-10 sound parameters count the five-frame sequence from frame 0.
    const auto frame = static_cast<std::int32_t>(editUnit_ % 5);
    if (clip_.rate.denominator == 1001) {
      NTSCSoundParameters parameters;
      count = parameters.getSampleCount(frame);
      sequence = parameters.getSequenceNumber(frame);
    } else {
      RegularSoundParameters parameters(static_cast<std::uint32_t>(clip_.rate.numerator / clip_.rate.denominator));
      count = parameters.getSampleCount(frame);
      sequence = parameters.getSequenceNumber(frame);
    }
  }
  channels_.clear();
  for (const std::unique_ptr<SoundInput>& sound : sounds_) {
    sound->read(count, fileChannels_);
    for (std::vector<std::uint8_t>& channel : fileChannels_) channels_.push_back(std::move(channel));
  }
  if (d10) codeD10Sound(channels_, clip_.quantizationBits / 8, count, sequence, clip_.declaredChannels, d10Sound_);
}

std::shared_ptr<ZeltaBuffer> WrapSource::getSound(std::uint32_t channel) {
  return lend(channel < channels_.size() ? channels_[channel] : noOctets);
}

std::shared_ptr<ZeltaBuffer> WrapSource::lend(const std::vector<std::uint8_t>& octets) {
  return std::make_shared<LentBuffer>(octets);
}

}  // namespace zelta_wrap
