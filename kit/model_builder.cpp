#include "kit/model_builder.h"

#include <cstdint>
#include <memory>
#include <vector>

#include "kit.h"
#include "kit/essence_formats.h"
#include "kit/model_labels.h"
#include "kit/user_stamp.h"
#include "metadata/present_time.h"

namespace zelta {

namespace {

// A date of the master, or the time of building when it has none.
MXFTimestamp dateOr(const MXFTimestamp& date, const MXFTimestamp& now) { return date == MXFTimestamp() ? now : date; }

// D-10 carries all its channels in one track, and none when it has no
// sound.
std::uint32_t soundTrackCount(const ModelBuild& build) {
  const std::uint32_t channels = build.master.getAudioChannelCount();
  if (build.format == ZeltaEssenceFormat::D10 && channels == 0) return 0;
  return getSoundTrackCount(build.format, channels);
}

// One essence track as both packages hold it.
struct EssenceTrack {
  std::uint32_t trackID;
  std::uint32_t trackNumber;
  KLVKey dataDefinition;
};

class ModelGraph {
 public:
  explicit ModelGraph(const ModelBuild& build)
      : build_(build),
        master_(build.master),
        now_(presentTimestamp()),
        soundTrackCount_(soundTrackCount(build)),
        hasData_(hasDataTrack(build.format, build.master.hasAncillaryData())),
        hasText_(build.format != ZeltaEssenceFormat::AVC || isFullSizeAVC(build.master)) {
    listEssenceTracks();
  }

  std::shared_ptr<Preface> preface() const {
    std::shared_ptr<Preface> preface = build_.make<Preface>();
    preface->setLastModifiedDate(modificationDate());
    preface->setVersion(build_.version);
    preface->addIdentification(identification());
    preface->setContentStorage(contentStorage());
    preface->setOperationalPattern(getOperationalPattern(build_.format));
    preface->setEssenceContainers(
        getEssenceContainers(build_.format, master_.getBitRate(), build_.editRate, soundTrackCount_ > 0, hasData_));
    if (hasText_) preface->setDMSchemes({textBasedDMScheme});
    return preface;
  }

 private:
  void listEssenceTracks() {
    std::uint32_t trackID = pictureTrackID;
    tracks_.push_back({trackID++, getPictureTrackNumber(build_.format), pictureDataDefinition});
    for (std::uint32_t i = 0; i < soundTrackCount_; ++i)
      tracks_.push_back({trackID++, getSoundTrackNumber(build_.format, i, soundTrackCount_), soundDataDefinition});
    if (hasData_)
      tracks_.push_back({trackID++, getDataTrackNumber(build_.format, soundTrackCount_), dataDataDefinition});
    staticTrackID_ = trackID;
  }

  MXFTimestamp modificationDate() const { return dateOr(master_.getModificationDate(), now_); }

  std::shared_ptr<Identification> identification() const {
    const ZeltaIdentification product = master_.getIdentification();
    std::shared_ptr<Identification> identification = build_.make<Identification>();
    identification->setThisGenerationUID(build_.uids.generate());
    identification->setCompanyName(product.companyName);
    identification->setProductName(product.productName);
    if (product.productVersion != MXFProductVersion()) identification->setProductVersion(product.productVersion);
    identification->setVersionString(product.versionString);
    identification->setProductUID(product.productUID);
    identification->setToolkitVersion(getZeltaToolkitVersion());
    identification->setPlatform(getZeltaPlatform());
    identification->setModificationDate(modificationDate());
    return identification;
  }

  std::shared_ptr<ContentStorage> contentStorage() const {
    std::shared_ptr<ContentStorage> storage = build_.make<ContentStorage>();
    storage->addPackage(materialPackage());
    storage->addPackage(sourcePackage());
    std::shared_ptr<EssenceContainerData> data = build_.make<EssenceContainerData>();
    data->setLinkedPackageUID(master_.getFilePackageUID());
    data->setIndexSID(master_.getIndexSID());
    data->setBodySID(master_.getBodySID());
    storage->addEssenceContainerData(data);
    return storage;
  }

  template <typename Package>
  std::shared_ptr<Package> package(const UMID& packageUID) const {
    std::shared_ptr<Package> package = build_.make<Package>();
    package->setPackageUID(packageUID);
    package->setPackageCreationDate(dateOr(master_.getCreationDate(), now_));
    package->setPackageModifiedDate(modificationDate());
    return package;
  }

  std::shared_ptr<MaterialPackage> materialPackage() const {
    std::shared_ptr<MaterialPackage> package = this->package<MaterialPackage>(master_.getMaterialPackageUID());
    const auto duration = static_cast<std::int64_t>(master_.getDuration());
    package->addTrack(timecodeTrack(0, duration, static_cast<std::int64_t>(master_.getStartTimecode())));
    for (const EssenceTrack& track : tracks_) {
      std::shared_ptr<SourceClip> clip = sourceClip(track.dataDefinition, duration);
      clip->setSourcePackageID(master_.getFilePackageUID());
      clip->setSourceTrackID(track.trackID);
      package->addTrack(timelineTrack(track.trackID, 0, 0, sequenceOf(clip)));
    }
    if (hasText_) package->addTrack(descriptiveTrack());
    return package;
  }

  // The newer model counts the file package's timeline from the origin.
  std::shared_ptr<SourcePackage> sourcePackage() const {
    std::shared_ptr<SourcePackage> package = this->package<SourcePackage>(master_.getFilePackageUID());
    if (!master_.getPackageName().empty()) package->setName(master_.getPackageName());
    const std::int64_t origin = master_.getOrigin();
    auto duration = static_cast<std::int64_t>(master_.getDuration());
    auto startTimecode = static_cast<std::int64_t>(master_.getStartTimecode());
    if (build_.isNewerModel()) {
      duration += origin;
      startTimecode -= origin;
    }
    package->addTrack(timecodeTrack(origin, duration, startTimecode));
    for (const EssenceTrack& track : tracks_)
      package->addTrack(timelineTrack(track.trackID, track.trackNumber, origin,
                                      sequenceOf(sourceClip(track.dataDefinition, duration))));
    package->setDescriptor(descriptor());
    return package;
  }

  std::shared_ptr<TimelineTrack> timelineTrack(std::uint32_t trackID, std::uint32_t trackNumber, std::int64_t origin,
                                               const std::shared_ptr<Segment>& segment) const {
    std::shared_ptr<TimelineTrack> track = build_.make<TimelineTrack>();
    track->setTrackID(trackID);
    track->setTrackNumber(trackNumber);
    track->setEditRate(build_.editRate);
    track->setOrigin(origin);
    track->setSegment(segment);
    return track;
  }

  std::shared_ptr<Sequence> sequenceOf(const std::shared_ptr<Component>& component) const {
    std::shared_ptr<Sequence> sequence = build_.make<Sequence>();
    sequence->setDataDefinition(component->getDataDefinition());
    if (component->hasDuration()) sequence->setDuration(component->getDuration());
    sequence->addComponent(component);
    return sequence;
  }

  // Pointing nowhere, as the file package's own clips do.
  std::shared_ptr<SourceClip> sourceClip(const KLVKey& dataDefinition, std::int64_t duration) const {
    std::shared_ptr<SourceClip> clip = build_.make<SourceClip>();
    clip->setDataDefinition(dataDefinition);
    clip->setDuration(duration);
    clip->setStartPosition(0);
    clip->setSourcePackageID(UMID());
    clip->setSourceTrackID(0);
    return clip;
  }

  std::shared_ptr<TimelineTrack> timecodeTrack(std::int64_t origin, std::int64_t duration,
                                               std::int64_t startTimecode) const {
    std::shared_ptr<TimecodeComponent> timecode = build_.make<TimecodeComponent>();
    timecode->setDataDefinition(timecodeDataDefinition);
    timecode->setDuration(duration);
    timecode->setRoundedTimecodeBase(static_cast<std::uint16_t>(getRoundedRate(build_.editRate)));
    timecode->setStartTimecode(startTimecode);
    timecode->setDropFrame(master_.isDropFrame());
    return timelineTrack(1, 0, origin, sequenceOf(timecode));
  }

  std::shared_ptr<StaticTrack> descriptiveTrack() const {
    std::shared_ptr<UTF8TextBasedSet> text = build_.make<UTF8TextBasedSet>();
    text->setTextBasedMetadataPayloadSchemeID(descriptiveTextPayloadScheme);
    text->setTextMIMEMediaType(descriptiveTextMIMEType);
    text->setTextLanguageCode(std::wstring());
    text->setUTF8TextData(master_.getDescriptiveText());
    std::shared_ptr<TextBasedDMFramework> framework = build_.make<TextBasedDMFramework>();
    framework->setTextBasedObject(text);
    std::shared_ptr<DMSegment> segment = build_.make<DMSegment>();
    segment->setDataDefinition(descriptiveDataDefinition);
    segment->setDMFramework(framework);
    std::shared_ptr<StaticTrack> track = build_.make<StaticTrack>();
    track->setTrackID(staticTrackID_);
    track->setTrackNumber(0);
    track->setSegment(sequenceOf(segment));
    return track;
  }

  std::shared_ptr<GenericDescriptor> descriptor() const {
    std::shared_ptr<FileDescriptor> picture = buildPictureDescriptor(build_);
    if (soundTrackCount_ == 0 && !hasData_) return picture;
    std::shared_ptr<MultipleDescriptor> multiple = build_.make<MultipleDescriptor>();
    multiple->setSampleRate(build_.editRate);
    multiple->setEssenceContainer(build_.format == ZeltaEssenceFormat::D10 ? build_.container
                                                                           : multipleEssenceContainer);
    multiple->addSubDescriptor(picture);
    for (const std::shared_ptr<FileDescriptor>& sound :
         buildSoundDescriptors(build_, soundTrackCount_, pictureTrackID + 1))
      multiple->addSubDescriptor(sound);
    if (hasData_) multiple->addSubDescriptor(buildDataDescriptor(build_, tracks_.back().trackID));
    return multiple;
  }

  const ModelBuild& build_;
  const ZeltaMasterMetadata& master_;
  const MXFTimestamp now_;
  const std::uint32_t soundTrackCount_;
  const bool hasData_;
  // Every model carries the descriptive text but a reduced AVC one.
  const bool hasText_;
  std::vector<EssenceTrack> tracks_;
  std::uint32_t staticTrackID_ = 0;
};

}  // namespace

}  // namespace zelta

std::shared_ptr<Preface> createZeltaMetadataModel(const std::shared_ptr<const ZeltaMasterMetadata>& master,
                                                  const std::shared_ptr<MXFUIDGenerator>& uidGenerator) {
  check(master != nullptr, "metadata is present");
  check(uidGenerator != nullptr, "instanceUID generator is present");
  const ZeltaEssenceFormat format = zelta::toEssenceFormat(master->getEssenceFormat());
  const MXFRational editRate = master->getEditRate();
  const zelta::ModelBuild build{*master,
                                *uidGenerator,
                                format,
                                editRate,
                                master->getPrefaceVersion(),
                                zelta::getEssenceContainer(format, master->getBitRate(), editRate)};
  return zelta::ModelGraph(build).preface();
}

std::shared_ptr<Preface> createZeltaMetadataModel(const std::shared_ptr<const ZeltaMasterMetadata>& master) {
  return createZeltaMetadataModel(master, std::make_shared<ZeltaDefaultUIDGenerator>());
}
