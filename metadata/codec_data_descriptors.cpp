#include <memory>

#include "metadata.h"
#include "metadata/descriptor_tables.h"

VBIDataDescriptor::VBIDataDescriptor() = default;
VBIDataDescriptor::~VBIDataDescriptor() = default;
std::shared_ptr<VBIDataDescriptor> VBIDataDescriptor::create() { return std::make_shared<VBIDataDescriptor>(); }

ANCDataDescriptor::ANCDataDescriptor() = default;
ANCDataDescriptor::~ANCDataDescriptor() = default;
std::shared_ptr<ANCDataDescriptor> ANCDataDescriptor::create() { return std::make_shared<ANCDataDescriptor>(); }

namespace zelta {

template <>
const PropertyTable<VBIDataDescriptor>& propertyTable<VBIDataDescriptor>() {
  typedef VBIDataDescriptor C;
  static const PropertyTable<C> table("VBIDataDescriptor", formatSetKey(0x5B), {});
  return table;
}

template <>
const PropertyTable<ANCDataDescriptor>& propertyTable<ANCDataDescriptor>() {
  typedef ANCDataDescriptor C;
  static const PropertyTable<C> table("ANCDataDescriptor", formatSetKey(0x5C), {});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<VBIDataDescriptor, DataDescriptorFactory>;
template class MetadataClassFactory<ANCDataDescriptor, DataDescriptorFactory>;
