// The format's composite with the composites of the codec descriptors
// beside it, as a model that holds those descriptors needs, and the objects
// of one class found anywhere in a model.
#ifndef ZELTA_TESTS_SUPPORT_CODEC_MODEL_H
#define ZELTA_TESTS_SUPPORT_CODEC_MODEL_H

#include <memory>
#include <vector>

#include "metadata.h"

namespace zelta_test {

class CodecModelFactory : public MXFMetadataModelFactory {
 public:
  CodecModelFactory();
  const Factories& getFactories() override { return factories_; }

 private:
  Factories factories_;
};

std::shared_ptr<MXFMetadataModelFactory> makeCodecModelFactory();

// Every object of the model, depth first in the order of coding.
std::vector<std::shared_ptr<const MetadataRoot>> modelObjects(const MXFMetadataModel& model);

// Those of them whose class is exactly T.
template <typename T>
std::vector<std::shared_ptr<const T>> objectsOf(const MXFMetadataModel& model) {
  std::vector<std::shared_ptr<const T>> found;
  for (const std::shared_ptr<const MetadataRoot>& object : modelObjects(model))
    if (typeid(*object) == typeid(T)) found.push_back(std::dynamic_pointer_cast<const T>(object));
  return found;
}

}  // namespace zelta_test

#endif
