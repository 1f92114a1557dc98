// What the parts of the model builder share: the master, the generator of
// instance UIDs and the values that every part decides on alike.
#ifndef ZELTA_KIT_MODEL_BUILDER_H
#define ZELTA_KIT_MODEL_BUILDER_H

#include <cstdint>
#include <memory>
#include <vector>

#include "kit.h"
#include "metadata.h"

namespace zelta {

// Preface versions from which the newer shape of the model applies.
inline constexpr std::uint16_t newerModelVersion = 0x0103;

struct ModelBuild {
  const ZeltaMasterMetadata& master;
  MXFUIDGenerator& uids;
  ZeltaEssenceFormat format;
  MXFRational editRate;
  std::uint16_t version;
  KLVKey container;

  bool isNewerModel() const { return version >= newerModelVersion; }

  // A new object of the class with a fresh instance UID.
  template <typename T>
  std::shared_ptr<T> make() const {
    std::shared_ptr<T> object = T::create();
    object->setInstanceUID(uids.generate());
    return object;
  }
};

// The first track ID that the picture, sound and data tracks count up from.
inline constexpr std::uint32_t pictureTrackID = 2;

// The picture descriptor of the master's format, linked to the picture
// track.
std::shared_ptr<FileDescriptor> buildPictureDescriptor(const ModelBuild& build);
// Whether an AVC picture has the full size, which a plain MPEG descriptor
// describes.
bool isFullSizeAVC(const ZeltaMasterMetadata& master);

// The sound descriptors in track order, the first linked to track
// firstTrackID.
std::vector<std::shared_ptr<FileDescriptor>> buildSoundDescriptors(const ModelBuild& build, std::uint32_t trackCount,
                                                                   std::uint32_t firstTrackID);
std::shared_ptr<FileDescriptor> buildDataDescriptor(const ModelBuild& build, std::uint32_t trackID);

}  // namespace zelta

#endif
