#include "support/kit_models.h"

#include <memory>
#include <vector>

namespace zelta_test {

std::vector<std::shared_ptr<const FileDescriptor>> fileDescriptorsOf(const Preface& preface) {
  std::vector<std::shared_ptr<const FileDescriptor>> descriptors;
  std::shared_ptr<const SourcePackage> package = packageOf<SourcePackage>(preface);
  if (!package) return descriptors;
  std::shared_ptr<const GenericDescriptor> descriptor = package->getDescriptor();
  if (auto multiple = std::dynamic_pointer_cast<const MultipleDescriptor>(descriptor)) {
    for (std::size_t i = 0; i < multiple->getSubDescriptorCount(); ++i)
      descriptors.push_back(multiple->getSubDescriptorAt(i));
  } else if (auto file = std::dynamic_pointer_cast<const FileDescriptor>(descriptor)) {
    descriptors.push_back(file);
  }
  return descriptors;
}

}  // namespace zelta_test
