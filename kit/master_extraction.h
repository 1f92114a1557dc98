// The parts of master extraction: the clip's structure, and the picture and
// sound of its descriptors.
#ifndef ZELTA_KIT_MASTER_EXTRACTION_H
#define ZELTA_KIT_MASTER_EXTRACTION_H

#include <vector>

#include "kit.h"

namespace zelta {

// The descriptors of the file package, sorted.
struct FileDescriptors {
  const PictureDescriptor* picture = nullptr;
  std::vector<const SoundDescriptor*> sounds;
  // The container that tells the format: the picture's, or the descriptor's
  // that stands alone.
  KLVKey container;
};

void extractPicture(const PictureDescriptor& picture, ZeltaEssenceFormat format, ZeltaDefaultMetadata& master);
void extractSound(const std::vector<const SoundDescriptor*>& sounds, ZeltaEssenceFormat format,
                  ZeltaDefaultMetadata& master);

}  // namespace zelta

#endif
