#include "kit/master_extraction.h"

#include <memory>
#include <string>

#include "kit/essence_formats.h"
#include "kit/labels.h"
#include "kit/model_labels.h"

namespace zelta {

namespace {

// Code points to UTF-8, each that is no scalar value as U+FFFD.
std::string utf8Of(std::wstring text) {
  for (wchar_t& c : text) {
    const auto point = static_cast<std::uint32_t>(c);
    if (point > 0x10FFFF || (point >= 0xD800 && point < 0xE000)) c = 0xFFFD;
  }
  return util::utf8::encode(text);
}

// Version octet aside, as every label.
bool holdsLabel(const std::vector<KLVKey>& labels, const KLVKey& label) {
  for (const KLVKey& l : labels)
    if (l == label) return true;
  return false;
}

void extractIdentification(const Preface& preface, ZeltaDefaultMetadata& m) {
  check(preface.getIdentificationCount() > 0, "model has Identifications");
  std::shared_ptr<const Identification> identification =
      preface.getIdentificationAt(preface.getIdentificationCount() - 1);
  check(identification != nullptr, "model has an Identification");
  m.identification.companyName = identification->getCompanyName();
  m.identification.productName = identification->getProductName();
  if (identification->hasProductVersion()) m.identification.productVersion = identification->getProductVersion();
  m.identification.versionString = identification->getVersionString();
  m.identification.productUID = identification->getProductUID();
}

// The file package UID for now, and the stream identifiers.
void extractEssenceContainerData(const ContentStorage& storage, ZeltaDefaultMetadata& m) {
  if (!storage.hasEssenceContainerData()) return;
  check(storage.getEssenceContainerDataCount() > 0 && storage.getEssenceContainerDataAt(0) != nullptr,
        "model has valid EssenceContainerData");
  std::shared_ptr<const EssenceContainerData> data = storage.getEssenceContainerDataAt(0);
  m.filePackageUID = data->getLinkedPackageUID();
  if (data->hasIndexSID()) m.indexSID = data->getIndexSID();
  m.bodySID = data->getBodySID();
}

template <typename Package>
std::shared_ptr<const Package> firstPackage(const ContentStorage& storage, const UMID* packageUID = nullptr) {
  for (std::size_t i = 0; i < storage.getPackageCount(); ++i) {
    auto package = std::dynamic_pointer_cast<const Package>(storage.getPackageAt(i));
    if (package && (!packageUID || package->getPackageUID() == *packageUID)) return package;
  }
  return nullptr;
}

// The sequence's only component, of the class that the track needs.
template <typename T>
std::shared_ptr<const T> onlyComponent(const std::shared_ptr<const Segment>& segment, const char* isSequence,
                                       const char* hasOne, const char* isComponent) {
  auto sequence = std::dynamic_pointer_cast<const Sequence>(segment);
  check(sequence != nullptr, isSequence);
  check(sequence->getComponentCount() == 1, hasOne);
  auto component = std::dynamic_pointer_cast<const T>(sequence->getComponentAt(0));
  check(component != nullptr, isComponent);
  return component;
}

void extractTimecode(const MaterialPackage& package, ZeltaDefaultMetadata& m) {
  for (std::size_t i = 0; i < package.getTrackCount(); ++i) {
    auto track = std::dynamic_pointer_cast<const TimelineTrack>(package.getTrackAt(i));
    if (!track) continue;
    std::shared_ptr<const Segment> segment = track->getSegment();
    check(segment != nullptr, "TimelineTrack has Segment");
    if (!(segment->getDataDefinition() == timecodeDataDefinition)) continue;
    check(segment->hasDuration(), "TIMECODE Track Segment has duration");
    m.duration = static_cast<std::uint64_t>(segment->getDuration());
    std::shared_ptr<const TimecodeComponent> timecode = onlyComponent<TimecodeComponent>(
        segment, "TIMECODE Track Segment is a Sequence", "TIMECODE Track Sequence has 1 Component",
        "TIMECODE Track has a TimecodeComponent");
    m.editRate = track->getEditRate();
    m.startTimecode = static_cast<std::uint64_t>(timecode->getStartTimecode());
    m.dropFrame = timecode->getDropFrame();
    return;
  }
  check(false, "MaterialPackage has a TIMECODE Track");
}

// The kit's text, as it stands or from UTF-16.
void extractText(const TextBasedObject* text, ZeltaDefaultMetadata& m) {
  if (!text || !(text->getTextBasedMetadataPayloadSchemeID() == descriptiveTextPayloadScheme)) return;
  if (auto utf8 = dynamic_cast<const UTF8TextBasedSet*>(text))
    m.descriptiveText = utf8->getUTF8TextData();
  else if (auto utf16 = dynamic_cast<const UTF16TextBasedSet*>(text))
    m.descriptiveText = utf8Of(utf16->getUTF16TextData());
}

void extractDescriptiveText(const MaterialPackage& package, ZeltaDefaultMetadata& m) {
  for (std::size_t i = 0; i < package.getTrackCount(); ++i) {
    auto track = std::dynamic_pointer_cast<const StaticTrack>(package.getTrackAt(i));
    if (!track) continue;
    std::shared_ptr<const Segment> segment = track->getSegment();
    check(segment != nullptr, "StaticTrack has Segment");
    if (!(segment->getDataDefinition() == descriptiveDataDefinition)) continue;
    std::shared_ptr<const DMSegment> dm = onlyComponent<DMSegment>(
        segment, "Descriptive Metadata Track Segment is a Sequence",
        "Descriptive Metadata Track Sequence has 1 Component", "Descriptive Metadata Track has a DMSegment");
    auto framework = std::dynamic_pointer_cast<const TextBasedDMFramework>(dm->getDMFramework());
    if (!framework) continue;
    extractText(framework->getTextBasedObject().get(), m);
    return;
  }
  check(false, "MaterialPackage has a Descriptive Metadata Track");
}

void extractSourcePackage(const SourcePackage& package, ZeltaDefaultMetadata& m) {
  m.filePackageUID = package.getPackageUID();
  m.creationDate = package.getPackageCreationDate();
  if (package.hasName()) m.packageName = package.getName();
  for (std::size_t i = 0; i < package.getTrackCount(); ++i) {
    if (auto track = std::dynamic_pointer_cast<const TimelineTrack>(package.getTrackAt(i))) {
      m.origin = track->getOrigin();
      return;
    }
  }
  check(false, "SourcePackage has a TimelineTrack");
}

// A multiple descriptor's picture and sound; a picture or a sound that
// stands alone.
FileDescriptors sortDescriptors(const GenericDescriptor& descriptor, ZeltaDefaultMetadata& m) {
  FileDescriptors sorted;
  if (auto multiple = dynamic_cast<const MultipleDescriptor*>(&descriptor)) {
    for (std::size_t i = 0; i < multiple->getSubDescriptorCount(); ++i) {
      const FileDescriptor* sub = multiple->getSubDescriptorAt(i).get();
      if (auto picture = dynamic_cast<const PictureDescriptor*>(sub)) {
        if (!sorted.picture) sorted.picture = picture;
      } else if (auto sound = dynamic_cast<const SoundDescriptor*>(sub)) {
        sorted.sounds.push_back(sound);
      } else if (dynamic_cast<const ANCDataDescriptor*>(sub)) {
        m.ancillaryData = true;
      }
    }
    check(sorted.picture != nullptr, "model has a PictureDescriptor");
    sorted.container = sorted.picture->getEssenceContainer();
  } else if (auto picture = dynamic_cast<const PictureDescriptor*>(&descriptor)) {
    sorted.picture = picture;
    sorted.container = picture->getEssenceContainer();
  } else if (auto sound = dynamic_cast<const SoundDescriptor*>(&descriptor)) {
    sorted.sounds.push_back(sound);
    sorted.container = sound->getEssenceContainer();
  }
  return sorted;
}

void extract(const std::shared_ptr<const Preface>& preface, ZeltaDefaultMetadata& m) {
  check(preface != nullptr, "model starts with Preface");
  m.modificationDate = preface->getLastModifiedDate();
  m.prefaceVersion = preface->getVersion();
  extractIdentification(*preface, m);
  std::shared_ptr<const ContentStorage> storage = preface->getContentStorage();
  check(storage != nullptr, "model has a ContentStorage");
  extractEssenceContainerData(*storage, m);
  std::shared_ptr<const MaterialPackage> material = firstPackage<MaterialPackage>(*storage);
  check(material != nullptr, "model has a MaterialPackage");
  m.materialPackageUID = material->getPackageUID();
  extractTimecode(*material, m);
  if (holdsLabel(preface->getDMSchemes(), textBasedDMScheme)) extractDescriptiveText(*material, m);
  const UMID filePackageUID = m.filePackageUID;
  std::shared_ptr<const SourcePackage> source =
      firstPackage<SourcePackage>(*storage, filePackageUID == UMID() ? nullptr : &filePackageUID);
  check(source != nullptr, "model has a SourcePackage");
  extractSourcePackage(*source, m);
  std::shared_ptr<const GenericDescriptor> descriptor = source->getDescriptor();
  if (!descriptor) return;
  const FileDescriptors descriptors = sortDescriptors(*descriptor, m);
  if (!descriptors.picture && descriptors.sounds.empty()) return;
  const ZeltaEssenceFormat format = getEssenceFormat(descriptors.container);
  m.essenceFormat = static_cast<std::uint32_t>(format);
  if (descriptors.picture) extractPicture(*descriptors.picture, format, m);
  extractSound(descriptors.sounds, format, m);
}

}  // namespace

}  // namespace zelta

std::shared_ptr<ZeltaMasterMetadata> createZeltaMasterMetadata(const std::shared_ptr<const Preface>& preface) {
  auto master = std::make_shared<ZeltaDefaultMetadata>();
  zelta::extract(preface, *master);
  return master;
}
