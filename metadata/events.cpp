#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

using zelta::presentValue;
using zelta::standardKey;

Event::Event() = default;
Event::~Event() = default;
std::shared_ptr<Event> Event::create() { return std::make_shared<Event>(); }

const std::int64_t& Event::getPosition() const { return presentValue(position_, "Event.position is present"); }

const std::wstring& Event::getComment() const { return presentValue(comment_, "Event.comment is present"); }

CommentMarker::CommentMarker() = default;
CommentMarker::~CommentMarker() = default;
std::shared_ptr<CommentMarker> CommentMarker::create() { return std::make_shared<CommentMarker>(); }

std::shared_ptr<SourceReference> CommentMarker::getAnnotation() {
  check(annotation_ != nullptr, "CommentMarker.annotation is present");
  return annotation_;
}

std::shared_ptr<const SourceReference> CommentMarker::getAnnotation() const {
  check(annotation_ != nullptr, "CommentMarker.annotation is present");
  return annotation_;
}

void CommentMarker::setAnnotation(const std::shared_ptr<SourceReference>& annotation) {
  swapOwnership(annotation_, annotation);
  annotation_ = annotation;
}

DMSegment::DMSegment() = default;
DMSegment::~DMSegment() = default;
std::shared_ptr<DMSegment> DMSegment::create() { return std::make_shared<DMSegment>(); }

const std::vector<std::uint32_t>& DMSegment::getTargetTrackIDs() const {
  return presentValue(targetTrackIDs_, "DMSegment.targetTrackIDs is present");
}

std::shared_ptr<DescriptiveMetadataFramework> DMSegment::getDMFramework() {
  check(dmFramework_ != nullptr, "DMSegment.dmFramework is present");
  return dmFramework_;
}

std::shared_ptr<const DescriptiveMetadataFramework> DMSegment::getDMFramework() const {
  check(dmFramework_ != nullptr, "DMSegment.dmFramework is present");
  return dmFramework_;
}

void DMSegment::setDMFramework(const std::shared_ptr<DescriptiveMetadataFramework>& dmFramework) {
  swapOwnership(dmFramework_, dmFramework);
  dmFramework_ = dmFramework;
}

namespace zelta {

template <>
const PropertyTable<Event>& propertyTable<Event>() {
  typedef Event C;
  static const PropertyTable<C> table(
      "Event", formatSetKey(0x06),
      {optionalValue("Event.position", 0x0601, &C::getPosition, &C::setPosition, &C::hasPosition),
       optionalValue("Event.comment", 0x0602, &C::getComment, &C::setComment, &C::hasComment)});
  return table;
}

template <>
const PropertyTable<CommentMarker>& propertyTable<CommentMarker>() {
  typedef CommentMarker C;
  // Not among the standard primer's keys.
  static const KLVKey annotationKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x02, 0x06,
                                                                 0x01, 0x01, 0x04, 0x02, 0x0A, 0x00, 0x00});
  static const PropertyTable<C> table(
      "CommentMarker", formatSetKey(0x08),
      {strongReference<C, SourceReference>("CommentMarker.annotation", {annotationKey, 0x0901}, &C::getAnnotation,
                                           &C::setAnnotation, &C::hasAnnotation)});
  return table;
}

template <>
const PropertyTable<DMSegment>& propertyTable<DMSegment>() {
  typedef DMSegment C;
  static const PropertyTable<C> table(
      "DMSegment", formatSetKey(0x41),
      {optionalValue("DMSegment.targetTrackIDs", 0x6102, &C::getTargetTrackIDs, &C::setTargetTrackIDs,
                     &C::hasTargetTrackIDs),
       strongReference<C, DescriptiveMetadataFramework>("DMSegment.dmFramework", 0x6101, &C::getDMFramework,
                                                        &C::setDMFramework, &C::hasDMFramework)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<Event, SegmentFactory>;
template class MetadataClassFactory<CommentMarker, EventFactory>;
template class MetadataClassFactory<DMSegment, CommentMarkerFactory>;
