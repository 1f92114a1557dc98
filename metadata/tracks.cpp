#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

using zelta::presentValue;
using zelta::standardKey;

Track::Track() = default;
Track::~Track() = default;
std::shared_ptr<Track> Track::create() { return std::make_shared<Track>(); }

const std::uint32_t& Track::getTrackNumber() const {
  return presentValue(trackNumber_, "Track.trackNumber is present");
}

const std::wstring& Track::getTrackName() const { return presentValue(trackName_, "Track.trackName is present"); }

std::shared_ptr<Segment> Track::getSegment() { return segment_; }

std::shared_ptr<const Segment> Track::getSegment() const { return segment_; }

void Track::setSegment(const std::shared_ptr<Segment>& segment) {
  swapOwnership(segment_, segment);
  segment_ = segment;
}

TimelineTrack::TimelineTrack() = default;
TimelineTrack::~TimelineTrack() = default;
std::shared_ptr<TimelineTrack> TimelineTrack::create() { return std::make_shared<TimelineTrack>(); }

EventTrack::EventTrack() = default;
EventTrack::~EventTrack() = default;
std::shared_ptr<EventTrack> EventTrack::create() { return std::make_shared<EventTrack>(); }

const std::int64_t& EventTrack::getOrigin() const { return presentValue(origin_, "EventTrack.origin is present"); }

StaticTrack::StaticTrack() = default;
StaticTrack::~StaticTrack() = default;
std::shared_ptr<StaticTrack> StaticTrack::create() { return std::make_shared<StaticTrack>(); }

namespace zelta {

template <>
const PropertyTable<Track>& propertyTable<Track>() {
  typedef Track C;
  static const PropertyTable<C> table(
      "Track", formatSetKey(0x38),
      {requiredValue("Track.trackID", 0x4801, &C::getTrackID, &C::setTrackID),
       optionalValue("Track.trackNumber", 0x4804, &C::getTrackNumber, &C::setTrackNumber, &C::hasTrackNumber),
       optionalValue("Track.trackName", 0x4802, &C::getTrackName, &C::setTrackName, &C::hasTrackName),
       strongReference<C, Segment>("Track.segment", 0x4803, &C::getSegment, &C::setSegment)});
  return table;
}

template <>
const PropertyTable<TimelineTrack>& propertyTable<TimelineTrack>() {
  typedef TimelineTrack C;
  static const PropertyTable<C> table(
      "TimelineTrack", formatSetKey(0x3B),
      {requiredValue("TimelineTrack.editRate", 0x4B01, &C::getEditRate, &C::setEditRate),
       requiredValue("TimelineTrack.origin", 0x4B02, &C::getOrigin, &C::setOrigin)});
  return table;
}

template <>
const PropertyTable<EventTrack>& propertyTable<EventTrack>() {
  typedef EventTrack C;
  static const PropertyTable<C> table(
      "EventTrack", formatSetKey(0x39),
      {requiredValue("EventTrack.editRate", 0x4901, &C::getEditRate, &C::setEditRate),
       optionalValue("EventTrack.origin", 0x4902, &C::getOrigin, &C::setOrigin, &C::hasOrigin)});
  return table;
}

template <>
const PropertyTable<StaticTrack>& propertyTable<StaticTrack>() {
  static const PropertyTable<StaticTrack> table("StaticTrack", formatSetKey(0x3A), {});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<Track, MetadataObjectFactory>;
template class MetadataClassFactory<TimelineTrack, TrackFactory>;
template class MetadataClassFactory<EventTrack, TrackFactory>;
template class MetadataClassFactory<StaticTrack, TrackFactory>;
