#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

using zelta::insertOwned;
using zelta::ownedAt;
using zelta::presentValue;
using zelta::removeOwned;
using zelta::standardKey;

Component::Component() = default;
Component::~Component() = default;
std::shared_ptr<Component> Component::create() { return std::make_shared<Component>(); }

const std::int64_t& Component::getDuration() const { return presentValue(duration_, "Component.duration is present"); }

Segment::Segment() = default;
Segment::~Segment() = default;
std::shared_ptr<Segment> Segment::create() { return std::make_shared<Segment>(); }

Sequence::Sequence() = default;
Sequence::~Sequence() = default;
std::shared_ptr<Sequence> Sequence::create() { return std::make_shared<Sequence>(); }

std::shared_ptr<Component> Sequence::getComponentAt(std::size_t index) { return ownedAt(components_, index); }

std::shared_ptr<const Component> Sequence::getComponentAt(std::size_t index) const {
  return ownedAt(components_, index);
}

void Sequence::addComponent(const std::shared_ptr<Component>& component) {
  insertComponentAt(components_.size(), component);
}

void Sequence::insertComponentAt(std::size_t index, const std::shared_ptr<Component>& component) {
  insertOwned(*this, components_, index, component);
}

void Sequence::removeComponentAt(std::size_t index) { removeOwned(*this, components_, index); }

SourceReference::SourceReference() = default;
SourceReference::~SourceReference() = default;
std::shared_ptr<SourceReference> SourceReference::create() { return std::make_shared<SourceReference>(); }

SourceClip::SourceClip() = default;
SourceClip::~SourceClip() = default;
std::shared_ptr<SourceClip> SourceClip::create() { return std::make_shared<SourceClip>(); }

DMSourceClip::DMSourceClip() = default;
DMSourceClip::~DMSourceClip() = default;
std::shared_ptr<DMSourceClip> DMSourceClip::create() { return std::make_shared<DMSourceClip>(); }

const std::vector<std::uint32_t>& DMSourceClip::getTargetTrackIDs() const {
  return presentValue(targetTrackIDs_, "DMSourceClip.targetTrackIDs is present");
}

TimecodeComponent::TimecodeComponent() = default;
TimecodeComponent::~TimecodeComponent() = default;
std::shared_ptr<TimecodeComponent> TimecodeComponent::create() { return std::make_shared<TimecodeComponent>(); }

namespace zelta {

template <>
const PropertyTable<Component>& propertyTable<Component>() {
  typedef Component C;
  static const PropertyTable<C> table(
      "Component", formatSetKey(0x02),
      {requiredValue("Component.dataDefinition", 0x0201, &C::getDataDefinition, &C::setDataDefinition),
       optionalValue("Component.duration", 0x0202, &C::getDuration, &C::setDuration, &C::hasDuration)});
  return table;
}

template <>
const PropertyTable<Segment>& propertyTable<Segment>() {
  static const PropertyTable<Segment> table("Segment", formatSetKey(0x03), {});
  return table;
}

template <>
const PropertyTable<Sequence>& propertyTable<Sequence>() {
  typedef Sequence C;
  static const PropertyTable<C> table(
      "Sequence", formatSetKey(0x0F),
      {referenceVector<C, Component>("Sequence.components", "Sequence.component", 0x1001, &C::getComponentCount,
                                     &C::getComponentAt, &C::insertComponentAt)});
  return table;
}

template <>
const PropertyTable<SourceReference>& propertyTable<SourceReference>() {
  typedef SourceReference C;
  static const PropertyTable<C> table(
      "SourceReference", formatSetKey(0x10),
      {requiredValue("SourceReference.sourcePackageID", 0x1101, &C::getSourcePackageID, &C::setSourcePackageID),
       requiredValue("SourceReference.sourceTrackID", 0x1102, &C::getSourceTrackID, &C::setSourceTrackID)});
  return table;
}

template <>
const PropertyTable<SourceClip>& propertyTable<SourceClip>() {
  typedef SourceClip C;
  static const PropertyTable<C> table(
      "SourceClip", formatSetKey(0x11),
      {requiredValue("SourceClip.startPosition", 0x1201, &C::getStartPosition, &C::setStartPosition)});
  return table;
}

template <>
const PropertyTable<DMSourceClip>& propertyTable<DMSourceClip>() {
  typedef DMSourceClip C;
  static const PropertyTable<C> table("DMSourceClip", formatSetKey(0x45),
                                      {optionalValue("DMSourceClip.targetTrackIDs", 0x6103, &C::getTargetTrackIDs,
                                                     &C::setTargetTrackIDs, &C::hasTargetTrackIDs)});
  return table;
}

template <>
const PropertyTable<TimecodeComponent>& propertyTable<TimecodeComponent>() {
  typedef TimecodeComponent C;
  static const PropertyTable<C> table(
      "TimecodeComponent", formatSetKey(0x14),
      {requiredValue("TimecodeComponent.startTimecode", 0x1501, &C::getStartTimecode, &C::setStartTimecode),
       requiredValue("TimecodeComponent.roundedTimecodeBase", 0x1502, &C::getRoundedTimecodeBase,
                     &C::setRoundedTimecodeBase),
       requiredValue("TimecodeComponent.dropFrame", 0x1503, &C::getDropFrame, &C::setDropFrame)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<Component, MetadataObjectFactory>;
template class MetadataClassFactory<Segment, ComponentFactory>;
template class MetadataClassFactory<Sequence, SegmentFactory>;
template class MetadataClassFactory<SourceReference, SegmentFactory>;
template class MetadataClassFactory<SourceClip, SourceReferenceFactory>;
template class MetadataClassFactory<DMSourceClip, SourceClipFactory>;
template class MetadataClassFactory<TimecodeComponent, SegmentFactory>;
