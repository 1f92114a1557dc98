#include <memory>

#include "metadata.h"

MetadataObject::MetadataObject() = default;

MetadataObject::~MetadataObject() = default;

std::shared_ptr<MetadataObject> MetadataObject::create() { return std::make_shared<MetadataObject>(); }

const MXFUID& MetadataObject::getGenerationUID() const {
  check(generationUID_.has_value(), "MetadataObject.generationUID is present");
  return *generationUID_;
}
