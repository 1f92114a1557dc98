#include "support/codec_model.h"

namespace zelta_test {

namespace {

void collect(MXFMetadataFactory& factory, const std::shared_ptr<const MetadataRoot>& object,
             std::vector<std::shared_ptr<const MetadataRoot>>& objects) {
  objects.push_back(object);
  // The composite codes only the types that it has been asked about.
  if (!factory.canCode(typeid(*object))) return;
  for (const std::shared_ptr<const MetadataRoot>& child : factory.code(object).referenced)
    collect(factory, child, objects);
}

}  // namespace

CodecModelFactory::CodecModelFactory()
    : factories_{std::make_shared<MXFFormatMetadataModelFactory>(), std::make_shared<MXFAES3MetadataModelFactory>(),
                 std::make_shared<MXFMPEGMetadataModelFactory>(), std::make_shared<MXFVBIANCMetadataModelFactory>()} {}

std::shared_ptr<MXFMetadataModelFactory> makeCodecModelFactory() { return std::make_shared<CodecModelFactory>(); }

std::vector<std::shared_ptr<const MetadataRoot>> modelObjects(const MXFMetadataModel& model) {
  CodecModelFactory factory;
  std::vector<std::shared_ptr<const MetadataRoot>> objects;
  for (const std::shared_ptr<MetadataRoot>& root : model) collect(factory, root, objects);
  return objects;
}

}  // namespace zelta_test
