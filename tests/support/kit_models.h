// Ways into a model that the kit built: its packages, their tracks and what
// the tracks' sequences hold, and the source package's descriptors.
#ifndef ZELTA_TESTS_SUPPORT_KIT_MODELS_H
#define ZELTA_TESTS_SUPPORT_KIT_MODELS_H

#include <memory>
#include <vector>

#include "metadata.h"

namespace zelta_test {

// The first package of the class in the content storage; null when none.
template <typename Package>
std::shared_ptr<const Package> packageOf(const Preface& preface) {
  std::shared_ptr<const ContentStorage> storage = preface.getContentStorage();
  for (std::size_t i = 0; storage && i < storage->getPackageCount(); ++i)
    if (auto package = std::dynamic_pointer_cast<const Package>(storage->getPackageAt(i))) return package;
  return nullptr;
}

// The only component of the track's sequence, as T; null when it is not one.
template <typename T>
std::shared_ptr<const T> componentOf(const Track& track) {
  auto sequence = std::dynamic_pointer_cast<const Sequence>(track.getSegment());
  if (!sequence || sequence->getComponentCount() != 1) return nullptr;
  return std::dynamic_pointer_cast<const T>(sequence->getComponentAt(0));
}

// The source package's file descriptors: the sub-descriptors of a multiple
// descriptor, or the one that stands alone.
std::vector<std::shared_ptr<const FileDescriptor>> fileDescriptorsOf(const Preface& preface);

}  // namespace zelta_test

#endif
