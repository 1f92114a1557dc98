#include <memory>

#include "metadata/acquisition/acquisition_support.h"

AcquisitionMetadataObject::AcquisitionMetadataObject() = default;
AcquisitionMetadataObject::~AcquisitionMetadataObject() = default;
std::shared_ptr<AcquisitionMetadataObject> AcquisitionMetadataObject::create() {
  return std::make_shared<AcquisitionMetadataObject>();
}

MXFAcquisitionMetadataModelFactory::MXFAcquisitionMetadataModelFactory()
    : factories_{std::make_shared<LensUnitMetadataFactory>(), std::make_shared<CameraUnitMetadataFactory>(),
                 std::make_shared<UserDefinedAcquisitionMetadataFactory>()} {}

MXFAcquisitionMetadataModelFactory::~MXFAcquisitionMetadataModelFactory() = default;

const MXFMetadataModelFactory::Factories& MXFAcquisitionMetadataModelFactory::getFactories() { return factories_; }

namespace zelta {

// Only the base of the three classes, with no sets of its own.
template <>
const PropertyTable<AcquisitionMetadataObject>& propertyTable<AcquisitionMetadataObject>() {
  static const PropertyTable<AcquisitionMetadataObject> table("AcquisitionMetadataObject", {});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<AcquisitionMetadataObject, MetadataRootFactory>;
