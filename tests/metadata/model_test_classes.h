// A small model for the tests of factories and model coding: an Album owns
// Songs (a LiveSong among them), a Song owns Credits, the Album owns one
// Artwork and names a favourite Song weakly. Each factory is driven by its
// class's property table.
#ifndef ZELTA_TESTS_METADATA_MODEL_TEST_CLASSES_H
#define ZELTA_TESTS_METADATA_MODEL_TEST_CLASSES_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "metadata.h"
#include "metadata/property_table.h"

namespace zelta_test {

// Set keys and property keys of the test classes.
inline KLVKey testSetKey(std::uint8_t n) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0E, 0x7F, 0x01, 0x01,
                                             0x01, 0x01, n, 0x00});
}
inline KLVKey testPropertyKey(std::uint8_t n) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x01, 0x0E, 0x7F, 0x02, n,
                                             0x00, 0x00, 0x00, 0x00});
}

class Song;

class Credit : public MetadataObject {
public:
  static std::shared_ptr<Credit> create() { return std::make_shared<Credit>(); }
  const std::uint8_t& getRole() const { return role_; }
  void setRole(const std::uint8_t& role) { role_ = role; }

  // Weak: the song that the credited person performs on.
  std::shared_ptr<const Song> getPerformer() const;
  void setPerformer(const std::shared_ptr<Song>& performer);
  bool hasPerformer() const { return hasPerformer_; }

private:
  std::uint8_t role_ = 0;
  std::weak_ptr<Song> performer_;
  bool hasPerformer_ = false;
};

class Artwork : public MetadataObject {
public:
  static std::shared_ptr<Artwork> create() { return std::make_shared<Artwork>(); }
  const std::uint32_t& getSize() const;
  void setSize(const std::uint32_t& size) { size_ = size; }
  bool hasSize() const { return size_.has_value(); }

private:
  std::optional<std::uint32_t> size_;
};

class Song : public MetadataObject {
public:
  static std::shared_ptr<Song> create() { return std::make_shared<Song>(); }
  const std::uint32_t& getNumber() const { return number_; }
  void setNumber(const std::uint32_t& number) { number_ = number; }

  std::size_t getCreditCount() const { return credits_.size(); }
  std::shared_ptr<const Credit> getCreditAt(std::size_t index) const;
  void addCredit(const std::shared_ptr<Credit>& credit) { insertCreditAt(credits_.size(), credit); }
  void insertCreditAt(std::size_t index, const std::shared_ptr<Credit>& credit);
  bool hasCredits() const { return hasCredits_; }

private:
  std::uint32_t number_ = 0;
  std::vector<std::shared_ptr<Credit>> credits_;
  bool hasCredits_ = false;
};

class LiveSong : public Song {
public:
  static std::shared_ptr<LiveSong> create() { return std::make_shared<LiveSong>(); }
  const std::uint16_t& getVenue() const { return venue_; }
  void setVenue(const std::uint16_t& venue) { venue_ = venue; }

private:
  std::uint16_t venue_ = 0;
};

class Album : public MetadataObject {
public:
  static std::shared_ptr<Album> create() { return std::make_shared<Album>(); }
  const std::uint16_t& getVersion() const { return version_; }
  void setVersion(const std::uint16_t& version) { version_ = version; }

  std::size_t getSongCount() const { return songs_.size(); }
  std::shared_ptr<const Song> getSongAt(std::size_t index) const;
  void addSong(const std::shared_ptr<Song>& song) { insertSongAt(songs_.size(), song); }
  void insertSongAt(std::size_t index, const std::shared_ptr<Song>& song);

  std::shared_ptr<const Artwork> getArtwork() const;
  void setArtwork(const std::shared_ptr<Artwork>& artwork);
  bool hasArtwork() const { return artwork_ != nullptr; }

  std::shared_ptr<const Song> getFavourite() const;
  void setFavourite(const std::shared_ptr<Song>& favourite);
  bool hasFavourite() const { return hasFavourite_; }

private:
  std::uint16_t version_ = 0;
  std::vector<std::shared_ptr<Song>> songs_;
  std::shared_ptr<Artwork> artwork_;
  std::weak_ptr<Song> favourite_;
  bool hasFavourite_ = false;
};

// A class whose sets may come with BER item lengths.
class Lyrics : public MetadataObject {
public:
  static std::shared_ptr<Lyrics> create() { return std::make_shared<Lyrics>(); }
};

// Factories, each over its class's table.

class AlbumFactory : public MetadataRootFactory {
public:
  AlbumFactory();
  std::shared_ptr<MetadataRoot> create() const override { return Album::create(); }
  const std::type_info& getType() const override { return typeid(Album); }
  const KLVKey& getSetKey() const override;
  void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                       MXFPendingReferences& references) const override;
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

class SongFactory : public MetadataRootFactory {
public:
  SongFactory();
  std::shared_ptr<MetadataRoot> create() const override { return Song::create(); }
  const std::type_info& getType() const override { return typeid(Song); }
  const KLVKey& getSetKey() const override;
  void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                       MXFPendingReferences& references) const override;
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

class LiveSongFactory : public SongFactory {
public:
  LiveSongFactory();
  std::shared_ptr<MetadataRoot> create() const override { return LiveSong::create(); }
  const std::type_info& getType() const override { return typeid(LiveSong); }
  const KLVKey& getSetKey() const override;
  void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                       MXFPendingReferences& references) const override;
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

class CreditFactory : public MetadataRootFactory {
public:
  CreditFactory();
  std::shared_ptr<MetadataRoot> create() const override { return Credit::create(); }
  const std::type_info& getType() const override { return typeid(Credit); }
  const KLVKey& getSetKey() const override;
  void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                       MXFPendingReferences& references) const override;
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

class ArtworkFactory : public MetadataRootFactory {
public:
  ArtworkFactory();
  std::shared_ptr<MetadataRoot> create() const override { return Artwork::create(); }
  const std::type_info& getType() const override { return typeid(Artwork); }
  const KLVKey& getSetKey() const override;
  void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                       MXFPendingReferences& references) const override;
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

class LyricsFactory : public MetadataRootFactory {
public:
  std::shared_ptr<MetadataRoot> create() const override { return Lyrics::create(); }
  const std::type_info& getType() const override { return typeid(Lyrics); }
  const KLVKey& getSetKey() const override;
  bool allowBERLengths() const override { return true; }
};

// The composite over all of them, Song before LiveSong.
class TestModelFactory : public MXFMetadataModelFactory {
public:
  TestModelFactory();
  const Factories& getFactories() override { return factories_; }

private:
  Factories factories_;
};

// The same, with one dark property of the Album declared a reference.
class DarkReferenceModelFactory : public TestModelFactory {
public:
  bool isReferenceDarkProperty(const KLVKey& setKey, const KLVKey& propertyKey) override;
};

// The key of the Album's declared dark reference.
KLVKey albumDarkReferenceKey();

// Keeps every model and counts start and end.
class RecordingModelHandler : public MXFMetadataModelHandler {
public:
  void start() override { events.push_back("start"); }
  void end() override { events.push_back("end"); }
  void model(const MXFMetadataModel& objects) override {
    events.push_back("model " + std::to_string(objects.size()));
    models.push_back(objects);
  }

  std::vector<std::string> events;
  std::vector<MXFMetadataModel> models;
};

// The tree under an object as indented lines: class, identifier, values,
// children in order, dark properties.
std::string describe(const std::shared_ptr<const MetadataRoot>& object);

// An identifier with every octet n, and its text.
MXFUID uidOf(std::uint8_t n);
std::string uidText(std::uint8_t n);

// Values as the sets hold them.
ByteVector uidBytes(std::uint8_t n);
ByteVector uidBatch(const std::vector<std::uint8_t>& ns);
ByteVector uint16Bytes(std::uint16_t value);
ByteVector uint32Bytes(std::uint32_t value);
// A set of the given key whose instance identifier has every octet n.
MXFPrimedSet primedSetOf(const KLVKey& setKey, std::uint8_t n, const MXFPropertyMap& properties);

// The six sets of the sample model: Album 01 (version 2, songs 02 and 03,
// artwork 06, favourite 03), Song 02 (number 1, credits 04 and 05),
// LiveSong 03 (number 2, venue 7), Credits 04 and 05 (roles 1 and 2),
// Artwork 06 (size 100).
std::vector<MXFPrimedSet> sampleSets();
// describe() of the sample model as parsed.
std::string sampleDescription();

}  // namespace zelta_test

#endif
