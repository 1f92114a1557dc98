// Zelta: the structural metadata classes and their factories. Part of
// metadata.h, which includes it.
#ifndef ZELTA_INCLUDE_METADATA_STRUCTURAL_H
#define ZELTA_INCLUDE_METADATA_STRUCTURAL_H

#include <cstddef>
#include <list>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <type_traits>
#include <typeinfo>
#include <variant>

#include "metadata_objects.h"

// ---------------------------------------------------------------------------
// Structural metadata classes
//
// The header metadata of a file: the Preface with its Identifications, the
// ContentStorage, the packages with their tracks and components. A
// required value always has one, at worst its default; the getter of an
// optional one checks that it is present. Reference vectors own their
// elements; the count of an unset optional vector is 0.

class Identification;
class ContentStorage;
class EssenceContainerData;
class GenericPackage;
class Track;
class Component;
class Segment;
class SourceReference;
class DescriptiveMetadataFramework;
class GenericDescriptor;

class ZELTA_EXPORT Preface : public MetadataObject {
public:
  // lastModifiedDate the present UTC time, version 0x0102.
  Preface();
  ~Preface() override;

  static std::shared_ptr<Preface> create();

  const MXFTimestamp& getLastModifiedDate() const { return lastModifiedDate_; }
  void setLastModifiedDate(const MXFTimestamp& lastModifiedDate) { lastModifiedDate_ = lastModifiedDate; }
  const std::uint16_t& getVersion() const { return version_; }
  void setVersion(const std::uint16_t& version) { version_ = version; }
  const std::uint32_t& getObjectModelVersion() const;
  void setObjectModelVersion(const std::uint32_t& objectModelVersion) { objectModelVersion_ = objectModelVersion; }
  bool hasObjectModelVersion() const { return objectModelVersion_.has_value(); }
  void removeObjectModelVersion() { objectModelVersion_.reset(); }

  // The one property that does not own: null once the package has gone.
  std::shared_ptr<GenericPackage> getPrimaryPackage();
  std::shared_ptr<const GenericPackage> getPrimaryPackage() const;
  void setPrimaryPackage(const std::shared_ptr<GenericPackage>& primaryPackage);
  bool hasPrimaryPackage() const { return hasPrimaryPackage_; }
  void removePrimaryPackage();

  std::size_t getIdentificationCount() const { return identifications_.size(); }
  std::shared_ptr<Identification> getIdentificationAt(std::size_t index);
  std::shared_ptr<const Identification> getIdentificationAt(std::size_t index) const;
  void addIdentification(const std::shared_ptr<Identification>& identification);
  void insertIdentificationAt(std::size_t index, const std::shared_ptr<Identification>& identification);
  void removeIdentificationAt(std::size_t index);

  std::shared_ptr<ContentStorage> getContentStorage();
  std::shared_ptr<const ContentStorage> getContentStorage() const;
  void setContentStorage(const std::shared_ptr<ContentStorage>& contentStorage);

  const KLVKey& getOperationalPattern() const { return operationalPattern_; }
  void setOperationalPattern(const KLVKey& operationalPattern) { operationalPattern_ = operationalPattern; }
  const std::vector<KLVKey>& getEssenceContainers() const { return essenceContainers_; }
  void setEssenceContainers(const std::vector<KLVKey>& essenceContainers) { essenceContainers_ = essenceContainers; }
  const std::vector<KLVKey>& getDMSchemes() const { return dmSchemes_; }
  void setDMSchemes(const std::vector<KLVKey>& dmSchemes) { dmSchemes_ = dmSchemes; }

private:
  MXFTimestamp lastModifiedDate_;
  std::uint16_t version_;
  std::optional<std::uint32_t> objectModelVersion_;
  std::weak_ptr<GenericPackage> primaryPackage_;
  bool hasPrimaryPackage_ = false;
  std::vector<std::shared_ptr<Identification>> identifications_;
  std::shared_ptr<ContentStorage> contentStorage_;
  KLVKey operationalPattern_;
  std::vector<KLVKey> essenceContainers_;
  std::vector<KLVKey> dmSchemes_;
};

class ZELTA_EXPORT Identification : public MetadataObject {
public:
  // thisGenerationUID from uuid_generate, modificationDate the present UTC
  // time.
  Identification();
  ~Identification() override;

  static std::shared_ptr<Identification> create();

  const MXFUID& getThisGenerationUID() const { return thisGenerationUID_; }
  void setThisGenerationUID(const MXFUID& thisGenerationUID) { thisGenerationUID_ = thisGenerationUID; }
  const std::wstring& getCompanyName() const { return companyName_; }
  void setCompanyName(const std::wstring& companyName) { companyName_ = companyName; }
  const std::wstring& getProductName() const { return productName_; }
  void setProductName(const std::wstring& productName) { productName_ = productName; }
  const MXFProductVersion& getProductVersion() const;
  void setProductVersion(const MXFProductVersion& productVersion) { productVersion_ = productVersion; }
  bool hasProductVersion() const { return productVersion_.has_value(); }
  void removeProductVersion() { productVersion_.reset(); }
  const std::wstring& getVersionString() const { return versionString_; }
  void setVersionString(const std::wstring& versionString) { versionString_ = versionString; }
  const MXFUID& getProductUID() const { return productUID_; }
  void setProductUID(const MXFUID& productUID) { productUID_ = productUID; }
  const MXFTimestamp& getModificationDate() const { return modificationDate_; }
  void setModificationDate(const MXFTimestamp& modificationDate) { modificationDate_ = modificationDate; }
  const MXFProductVersion& getToolkitVersion() const;
  void setToolkitVersion(const MXFProductVersion& toolkitVersion) { toolkitVersion_ = toolkitVersion; }
  bool hasToolkitVersion() const { return toolkitVersion_.has_value(); }
  void removeToolkitVersion() { toolkitVersion_.reset(); }
  const std::wstring& getPlatform() const;
  void setPlatform(const std::wstring& platform) { platform_ = platform; }
  bool hasPlatform() const { return platform_.has_value(); }
  void removePlatform() { platform_.reset(); }

private:
  MXFUID thisGenerationUID_;
  std::wstring companyName_;
  std::wstring productName_;
  std::optional<MXFProductVersion> productVersion_;
  std::wstring versionString_;
  MXFUID productUID_;
  MXFTimestamp modificationDate_;
  std::optional<MXFProductVersion> toolkitVersion_;
  std::optional<std::wstring> platform_;
};

class ZELTA_EXPORT ContentStorage : public MetadataObject {
public:
  ContentStorage();
  ~ContentStorage() override;

  static std::shared_ptr<ContentStorage> create();

  std::size_t getPackageCount() const { return packages_.size(); }
  std::shared_ptr<GenericPackage> getPackageAt(std::size_t index);
  std::shared_ptr<const GenericPackage> getPackageAt(std::size_t index) const;
  void addPackage(const std::shared_ptr<GenericPackage>& package);
  void insertPackageAt(std::size_t index, const std::shared_ptr<GenericPackage>& package);
  void removePackageAt(std::size_t index);

  std::size_t getEssenceContainerDataCount() const { return essenceContainerData_.size(); }
  std::shared_ptr<EssenceContainerData> getEssenceContainerDataAt(std::size_t index);
  std::shared_ptr<const EssenceContainerData> getEssenceContainerDataAt(std::size_t index) const;
  void addEssenceContainerData(const std::shared_ptr<EssenceContainerData>& essenceContainerData);
  void insertEssenceContainerDataAt(std::size_t index,
                                    const std::shared_ptr<EssenceContainerData>& essenceContainerData);
  void removeEssenceContainerDataAt(std::size_t index);
  bool hasEssenceContainerData() const { return hasEssenceContainerData_; }
  // Drops the elements without releasing them.
  void removeEssenceContainerData();

private:
  std::vector<std::shared_ptr<GenericPackage>> packages_;
  std::vector<std::shared_ptr<EssenceContainerData>> essenceContainerData_;
  bool hasEssenceContainerData_ = false;
};

class ZELTA_EXPORT EssenceContainerData : public MetadataObject {
public:
  EssenceContainerData();
  ~EssenceContainerData() override;

  static std::shared_ptr<EssenceContainerData> create();

  // Binds by package identifier, not by reference.
  const UMID& getLinkedPackageUID() const { return linkedPackageUID_; }
  void setLinkedPackageUID(const UMID& linkedPackageUID) { linkedPackageUID_ = linkedPackageUID; }
  const std::uint32_t& getIndexSID() const;
  void setIndexSID(const std::uint32_t& indexSID) { indexSID_ = indexSID; }
  bool hasIndexSID() const { return indexSID_.has_value(); }
  void removeIndexSID() { indexSID_.reset(); }
  const std::uint32_t& getBodySID() const { return bodySID_; }
  void setBodySID(const std::uint32_t& bodySID) { bodySID_ = bodySID; }

private:
  UMID linkedPackageUID_;
  std::optional<std::uint32_t> indexSID_;
  std::uint32_t bodySID_ = 0;
};

class ZELTA_EXPORT GenericPackage : public MetadataObject {
public:
  // Both dates the present UTC time, and a new packageUID.
  GenericPackage();
  ~GenericPackage() override;

  static std::shared_ptr<GenericPackage> create();

  const UMID& getPackageUID() const { return packageUID_; }
  void setPackageUID(const UMID& packageUID) { packageUID_ = packageUID; }
  const std::wstring& getName() const;
  void setName(const std::wstring& name) { name_ = name; }
  bool hasName() const { return name_.has_value(); }
  void removeName() { name_.reset(); }
  const MXFTimestamp& getPackageCreationDate() const { return packageCreationDate_; }
  void setPackageCreationDate(const MXFTimestamp& packageCreationDate) { packageCreationDate_ = packageCreationDate; }
  const MXFTimestamp& getPackageModifiedDate() const { return packageModifiedDate_; }
  void setPackageModifiedDate(const MXFTimestamp& packageModifiedDate) { packageModifiedDate_ = packageModifiedDate; }

  std::size_t getTrackCount() const { return tracks_.size(); }
  std::shared_ptr<Track> getTrackAt(std::size_t index);
  std::shared_ptr<const Track> getTrackAt(std::size_t index) const;
  void addTrack(const std::shared_ptr<Track>& track);
  void insertTrackAt(std::size_t index, const std::shared_ptr<Track>& track);
  void removeTrackAt(std::size_t index);

private:
  UMID packageUID_;
  std::optional<std::wstring> name_;
  MXFTimestamp packageCreationDate_;
  MXFTimestamp packageModifiedDate_;
  std::vector<std::shared_ptr<Track>> tracks_;
};

class ZELTA_EXPORT MaterialPackage : public GenericPackage {
public:
  MaterialPackage();
  ~MaterialPackage() override;

  static std::shared_ptr<MaterialPackage> create();
};

class ZELTA_EXPORT SourcePackage : public GenericPackage {
public:
  SourcePackage();
  ~SourcePackage() override;

  static std::shared_ptr<SourcePackage> create();

  std::shared_ptr<GenericDescriptor> getDescriptor();
  std::shared_ptr<const GenericDescriptor> getDescriptor() const;
  void setDescriptor(const std::shared_ptr<GenericDescriptor>& descriptor);

private:
  std::shared_ptr<GenericDescriptor> descriptor_;
};

class ZELTA_EXPORT Track : public MetadataObject {
public:
  Track();
  ~Track() override;

  static std::shared_ptr<Track> create();

  const std::uint32_t& getTrackID() const { return trackID_; }
  void setTrackID(const std::uint32_t& trackID) { trackID_ = trackID; }
  const std::uint32_t& getTrackNumber() const;
  void setTrackNumber(const std::uint32_t& trackNumber) { trackNumber_ = trackNumber; }
  bool hasTrackNumber() const { return trackNumber_.has_value(); }
  void removeTrackNumber() { trackNumber_.reset(); }
  const std::wstring& getTrackName() const;
  void setTrackName(const std::wstring& trackName) { trackName_ = trackName; }
  bool hasTrackName() const { return trackName_.has_value(); }
  void removeTrackName() { trackName_.reset(); }

  std::shared_ptr<Segment> getSegment();
  std::shared_ptr<const Segment> getSegment() const;
  void setSegment(const std::shared_ptr<Segment>& segment);

private:
  std::uint32_t trackID_ = 0;
  std::optional<std::uint32_t> trackNumber_;
  std::optional<std::wstring> trackName_;
  std::shared_ptr<Segment> segment_;
};

class ZELTA_EXPORT TimelineTrack : public Track {
public:
  TimelineTrack();
  ~TimelineTrack() override;

  static std::shared_ptr<TimelineTrack> create();

  const MXFRational& getEditRate() const { return editRate_; }
  void setEditRate(const MXFRational& editRate) { editRate_ = editRate; }
  const std::int64_t& getOrigin() const { return origin_; }
  void setOrigin(const std::int64_t& origin) { origin_ = origin; }

private:
  MXFRational editRate_;
  std::int64_t origin_ = 0;
};

class ZELTA_EXPORT EventTrack : public Track {
public:
  EventTrack();
  ~EventTrack() override;

  static std::shared_ptr<EventTrack> create();

  const MXFRational& getEditRate() const { return editRate_; }
  void setEditRate(const MXFRational& editRate) { editRate_ = editRate; }
  const std::int64_t& getOrigin() const;
  void setOrigin(const std::int64_t& origin) { origin_ = origin; }
  bool hasOrigin() const { return origin_.has_value(); }
  void removeOrigin() { origin_.reset(); }

private:
  MXFRational editRate_;
  std::optional<std::int64_t> origin_;
};

class ZELTA_EXPORT StaticTrack : public Track {
public:
  StaticTrack();
  ~StaticTrack() override;

  static std::shared_ptr<StaticTrack> create();
};

class ZELTA_EXPORT Component : public MetadataObject {
public:
  Component();
  ~Component() override;

  static std::shared_ptr<Component> create();

  const KLVKey& getDataDefinition() const { return dataDefinition_; }
  void setDataDefinition(const KLVKey& dataDefinition) { dataDefinition_ = dataDefinition; }
  const std::int64_t& getDuration() const;
  void setDuration(const std::int64_t& duration) { duration_ = duration; }
  bool hasDuration() const { return duration_.has_value(); }
  void removeDuration() { duration_.reset(); }

private:
  KLVKey dataDefinition_;
  std::optional<std::int64_t> duration_;
};

class ZELTA_EXPORT Segment : public Component {
public:
  Segment();
  ~Segment() override;

  static std::shared_ptr<Segment> create();
};

class ZELTA_EXPORT Sequence : public Segment {
public:
  Sequence();
  ~Sequence() override;

  static std::shared_ptr<Sequence> create();

  std::size_t getComponentCount() const { return components_.size(); }
  std::shared_ptr<Component> getComponentAt(std::size_t index);
  std::shared_ptr<const Component> getComponentAt(std::size_t index) const;
  void addComponent(const std::shared_ptr<Component>& component);
  void insertComponentAt(std::size_t index, const std::shared_ptr<Component>& component);
  void removeComponentAt(std::size_t index);

private:
  std::vector<std::shared_ptr<Component>> components_;
};

class ZELTA_EXPORT SourceReference : public Segment {
public:
  SourceReference();
  ~SourceReference() override;

  static std::shared_ptr<SourceReference> create();

  // Binds by package identifier, not by reference.
  const UMID& getSourcePackageID() const { return sourcePackageID_; }
  void setSourcePackageID(const UMID& sourcePackageID) { sourcePackageID_ = sourcePackageID; }
  const std::uint32_t& getSourceTrackID() const { return sourceTrackID_; }
  void setSourceTrackID(const std::uint32_t& sourceTrackID) { sourceTrackID_ = sourceTrackID; }

private:
  UMID sourcePackageID_;
  std::uint32_t sourceTrackID_ = 0;
};

class ZELTA_EXPORT SourceClip : public SourceReference {
public:
  SourceClip();
  ~SourceClip() override;

  static std::shared_ptr<SourceClip> create();

  const std::int64_t& getStartPosition() const { return startPosition_; }
  void setStartPosition(const std::int64_t& startPosition) { startPosition_ = startPosition; }

private:
  std::int64_t startPosition_ = 0;
};

class ZELTA_EXPORT DMSourceClip : public SourceClip {
public:
  DMSourceClip();
  ~DMSourceClip() override;

  static std::shared_ptr<DMSourceClip> create();

  const std::vector<std::uint32_t>& getTargetTrackIDs() const;
  void setTargetTrackIDs(const std::vector<std::uint32_t>& targetTrackIDs) { targetTrackIDs_ = targetTrackIDs; }
  bool hasTargetTrackIDs() const { return targetTrackIDs_.has_value(); }
  void removeTargetTrackIDs() { targetTrackIDs_.reset(); }

private:
  std::optional<std::vector<std::uint32_t>> targetTrackIDs_;
};

class ZELTA_EXPORT TimecodeComponent : public Segment {
public:
  TimecodeComponent();
  ~TimecodeComponent() override;

  static std::shared_ptr<TimecodeComponent> create();

  const std::int64_t& getStartTimecode() const { return startTimecode_; }
  void setStartTimecode(const std::int64_t& startTimecode) { startTimecode_ = startTimecode; }
  const std::uint16_t& getRoundedTimecodeBase() const { return roundedTimecodeBase_; }
  void setRoundedTimecodeBase(const std::uint16_t& roundedTimecodeBase) { roundedTimecodeBase_ = roundedTimecodeBase; }
  const bool& getDropFrame() const { return dropFrame_; }
  void setDropFrame(const bool& dropFrame) { dropFrame_ = dropFrame; }

private:
  std::int64_t startTimecode_ = 0;
  std::uint16_t roundedTimecodeBase_ = 0;
  bool dropFrame_ = false;
};

class ZELTA_EXPORT Event : public Segment {
public:
  Event();
  ~Event() override;

  static std::shared_ptr<Event> create();

  const std::int64_t& getPosition() const;
  void setPosition(const std::int64_t& position) { position_ = position; }
  bool hasPosition() const { return position_.has_value(); }
  void removePosition() { position_.reset(); }
  const std::wstring& getComment() const;
  void setComment(const std::wstring& comment) { comment_ = comment; }
  bool hasComment() const { return comment_.has_value(); }
  void removeComment() { comment_.reset(); }

private:
  std::optional<std::int64_t> position_;
  std::optional<std::wstring> comment_;
};

class ZELTA_EXPORT CommentMarker : public Event {
public:
  CommentMarker();
  ~CommentMarker() override;

  static std::shared_ptr<CommentMarker> create();

  std::shared_ptr<SourceReference> getAnnotation();
  std::shared_ptr<const SourceReference> getAnnotation() const;
  void setAnnotation(const std::shared_ptr<SourceReference>& annotation);
  bool hasAnnotation() const { return annotation_ != nullptr; }
  // Drops the object without releasing it.
  void removeAnnotation() { annotation_.reset(); }

private:
  std::shared_ptr<SourceReference> annotation_;
};

class ZELTA_EXPORT DMSegment : public CommentMarker {
public:
  DMSegment();
  ~DMSegment() override;

  static std::shared_ptr<DMSegment> create();

  const std::vector<std::uint32_t>& getTargetTrackIDs() const;
  void setTargetTrackIDs(const std::vector<std::uint32_t>& targetTrackIDs) { targetTrackIDs_ = targetTrackIDs; }
  bool hasTargetTrackIDs() const { return targetTrackIDs_.has_value(); }
  void removeTargetTrackIDs() { targetTrackIDs_.reset(); }

  std::shared_ptr<DescriptiveMetadataFramework> getDMFramework();
  std::shared_ptr<const DescriptiveMetadataFramework> getDMFramework() const;
  void setDMFramework(const std::shared_ptr<DescriptiveMetadataFramework>& dmFramework);
  bool hasDMFramework() const { return dmFramework_ != nullptr; }
  // Drops the object without releasing it.
  void removeDMFramework() { dmFramework_.reset(); }

private:
  std::optional<std::vector<std::uint32_t>> targetTrackIDs_;
  std::shared_ptr<DescriptiveMetadataFramework> dmFramework_;
};

// The bases of the descriptive metadata schemes.
class ZELTA_EXPORT DescriptiveMetadataFramework : public MetadataObject {
public:
  DescriptiveMetadataFramework();
  ~DescriptiveMetadataFramework() override;

  static std::shared_ptr<DescriptiveMetadataFramework> create();
};

class ZELTA_EXPORT DescriptiveMetadataObject : public MetadataObject {
public:
  DescriptiveMetadataObject();
  ~DescriptiveMetadataObject() override;

  static std::shared_ptr<DescriptiveMetadataObject> create();
};

// Their factories. Those of Component, Segment, GenericPackage, Track and the
// two descriptive bases serve as bases only: no composite registers them.
class PrefaceFactory : public MetadataClassFactory<Preface, MetadataObjectFactory> {};
class IdentificationFactory : public MetadataClassFactory<Identification, MetadataObjectFactory> {};
class ContentStorageFactory : public MetadataClassFactory<ContentStorage, MetadataObjectFactory> {};
class EssenceContainerDataFactory : public MetadataClassFactory<EssenceContainerData, MetadataObjectFactory> {};
class GenericPackageFactory : public MetadataClassFactory<GenericPackage, MetadataObjectFactory> {};
class MaterialPackageFactory : public MetadataClassFactory<MaterialPackage, GenericPackageFactory> {};
class SourcePackageFactory : public MetadataClassFactory<SourcePackage, GenericPackageFactory> {};
class TrackFactory : public MetadataClassFactory<Track, MetadataObjectFactory> {};
class TimelineTrackFactory : public MetadataClassFactory<TimelineTrack, TrackFactory> {};
class EventTrackFactory : public MetadataClassFactory<EventTrack, TrackFactory> {};
class StaticTrackFactory : public MetadataClassFactory<StaticTrack, TrackFactory> {};
class ComponentFactory : public MetadataClassFactory<Component, MetadataObjectFactory> {};
class SegmentFactory : public MetadataClassFactory<Segment, ComponentFactory> {};
class SequenceFactory : public MetadataClassFactory<Sequence, SegmentFactory> {};
class SourceReferenceFactory : public MetadataClassFactory<SourceReference, SegmentFactory> {};
class SourceClipFactory : public MetadataClassFactory<SourceClip, SourceReferenceFactory> {};
class DMSourceClipFactory : public MetadataClassFactory<DMSourceClip, SourceClipFactory> {};
class TimecodeComponentFactory : public MetadataClassFactory<TimecodeComponent, SegmentFactory> {};
class EventFactory : public MetadataClassFactory<Event, SegmentFactory> {};
class CommentMarkerFactory : public MetadataClassFactory<CommentMarker, EventFactory> {};
class DMSegmentFactory : public MetadataClassFactory<DMSegment, CommentMarkerFactory> {};
class DescriptiveMetadataFrameworkFactory
    : public MetadataClassFactory<DescriptiveMetadataFramework, MetadataObjectFactory> {};
class DescriptiveMetadataObjectFactory
    : public MetadataClassFactory<DescriptiveMetadataObject, MetadataObjectFactory> {};

#endif
