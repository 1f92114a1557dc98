#include "metadata/model_test_classes.h"

#include <iomanip>
#include <sstream>
#include <variant>

using zelta::PropertyTable;

namespace zelta_test {

const std::uint32_t& Artwork::getSize() const {
  check(size_.has_value(), "Artwork.size is present");
  return *size_;
}

std::shared_ptr<const Song> Credit::getPerformer() const {
  check(hasPerformer_, "Credit.performer is present");
  return performer_.lock();
}

void Credit::setPerformer(const std::shared_ptr<Song>& performer) {
  performer_ = performer;
  hasPerformer_ = true;
}

std::shared_ptr<const Credit> Song::getCreditAt(std::size_t index) const {
  check(index < credits_.size(), "valid index");
  return credits_[index];
}

void Song::insertCreditAt(std::size_t index, const std::shared_ptr<Credit>& credit) {
  check(index <= credits_.size(), "valid index");
  takeOwnership(credit);
  credits_.insert(credits_.begin() + static_cast<std::ptrdiff_t>(index), credit);
  hasCredits_ = true;
}

std::shared_ptr<const Song> Album::getSongAt(std::size_t index) const {
  check(index < songs_.size(), "valid index");
  return songs_[index];
}

void Album::insertSongAt(std::size_t index, const std::shared_ptr<Song>& song) {
  check(index <= songs_.size(), "valid index");
  takeOwnership(song);
  songs_.insert(songs_.begin() + static_cast<std::ptrdiff_t>(index), song);
}

std::shared_ptr<const Artwork> Album::getArtwork() const {
  check(artwork_ != nullptr, "Album.artwork is present");
  return artwork_;
}

void Album::setArtwork(const std::shared_ptr<Artwork>& artwork) {
  swapOwnership(artwork_, artwork);
  artwork_ = artwork;
}

std::shared_ptr<const Song> Album::getFavourite() const {
  check(hasFavourite_, "Album.favourite is present");
  return favourite_.lock();
}

void Album::setFavourite(const std::shared_ptr<Song>& favourite) {
  favourite_ = favourite;
  hasFavourite_ = true;
}

namespace {

const PropertyTable<Album>& albumTable() {
  static const PropertyTable<Album> table(
      "Album",
      {zelta::requiredValue("Album.version", {testPropertyKey(0x01), 0x7F01}, &Album::getVersion, &Album::setVersion),
       zelta::referenceVector<Album, Song>("Album.songs", "Album.song", {testPropertyKey(0x03), 0x7F03},
                                           &Album::getSongCount, &Album::getSongAt, &Album::insertSongAt),
       zelta::strongReference<Album, Artwork>("Album.artwork", {testPropertyKey(0x04), 0x7F04}, &Album::getArtwork,
                                              &Album::setArtwork, &Album::hasArtwork),
       zelta::weakReference<Album, Song>("Album.favourite", {testPropertyKey(0x05), 0x7F05}, &Album::getFavourite,
                                         &Album::setFavourite, &Album::hasFavourite)});
  return table;
}

const PropertyTable<Song>& songTable() {
  static const PropertyTable<Song> table(
      "Song", {zelta::requiredValue("Song.number", {testPropertyKey(0x11), 0x7F11}, &Song::getNumber, &Song::setNumber),
               zelta::referenceVector<Song, Credit>("Song.credits", "Song.credit", {testPropertyKey(0x12), 0x7F12},
                                                    &Song::getCreditCount, &Song::getCreditAt, &Song::insertCreditAt,
                                                    &Song::hasCredits)});
  return table;
}

const PropertyTable<LiveSong>& liveSongTable() {
  static const PropertyTable<LiveSong> table(
      "LiveSong", {zelta::requiredValue("LiveSong.venue", {testPropertyKey(0x21), 0x8001}, &LiveSong::getVenue,
                                        &LiveSong::setVenue)});
  return table;
}

const PropertyTable<Credit>& creditTable() {
  static const PropertyTable<Credit> table(
      "Credit",
      {zelta::requiredValue("Credit.role", {testPropertyKey(0x31), 0x7F31}, &Credit::getRole, &Credit::setRole),
       zelta::weakReference<Credit, Song>("Credit.performer", {testPropertyKey(0x32), 0x7F32}, &Credit::getPerformer,
                                          &Credit::setPerformer, &Credit::hasPerformer)});
  return table;
}

const PropertyTable<Artwork>& artworkTable() {
  static const PropertyTable<Artwork> table(
      "Artwork", {zelta::optionalValue("Artwork.size", {testPropertyKey(0x41), 0x7F41}, &Artwork::getSize,
                                       &Artwork::setSize, &Artwork::hasSize)});
  return table;
}

}  // namespace

AlbumFactory::AlbumFactory() { albumTable().enterInto(getSetPrimer()); }
const KLVKey& AlbumFactory::getSetKey() const {
  static const KLVKey key = testSetKey(0x01);
  return key;
}
void AlbumFactory::parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                                   MXFPendingReferences& references) const {
  albumTable().parse(*this, properties, object, references);
  MetadataRootFactory::parseProperties(properties, object, references);
}
void AlbumFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                                  MXFReferencedObjects& referenced) const {
  const Album& album = albumTable().cast(object);
  MetadataRootFactory::codeProperties(object, properties, referenced);
  albumTable().code(album, properties, referenced);
}

SongFactory::SongFactory() { songTable().enterInto(getSetPrimer()); }
const KLVKey& SongFactory::getSetKey() const {
  static const KLVKey key = testSetKey(0x02);
  return key;
}
void SongFactory::parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                                  MXFPendingReferences& references) const {
  songTable().parse(*this, properties, object, references);
  MetadataRootFactory::parseProperties(properties, object, references);
}
void SongFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                                 MXFReferencedObjects& referenced) const {
  const Song& song = songTable().cast(object);
  MetadataRootFactory::codeProperties(object, properties, referenced);
  songTable().code(song, properties, referenced);
}

LiveSongFactory::LiveSongFactory() { liveSongTable().enterInto(getSetPrimer()); }
const KLVKey& LiveSongFactory::getSetKey() const {
  static const KLVKey key = testSetKey(0x03);
  return key;
}
void LiveSongFactory::parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                                      MXFPendingReferences& references) const {
  liveSongTable().parse(*this, properties, object, references);
  SongFactory::parseProperties(properties, object, references);
}
void LiveSongFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                                     MXFReferencedObjects& referenced) const {
  const LiveSong& song = liveSongTable().cast(object);
  SongFactory::codeProperties(object, properties, referenced);
  liveSongTable().code(song, properties, referenced);
}

CreditFactory::CreditFactory() { creditTable().enterInto(getSetPrimer()); }
const KLVKey& CreditFactory::getSetKey() const {
  static const KLVKey key = testSetKey(0x04);
  return key;
}
void CreditFactory::parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                                    MXFPendingReferences& references) const {
  creditTable().parse(*this, properties, object, references);
  MetadataRootFactory::parseProperties(properties, object, references);
}
void CreditFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                                   MXFReferencedObjects& referenced) const {
  const Credit& credit = creditTable().cast(object);
  MetadataRootFactory::codeProperties(object, properties, referenced);
  creditTable().code(credit, properties, referenced);
}

ArtworkFactory::ArtworkFactory() { artworkTable().enterInto(getSetPrimer()); }
const KLVKey& ArtworkFactory::getSetKey() const {
  static const KLVKey key = testSetKey(0x05);
  return key;
}
void ArtworkFactory::parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                                     MXFPendingReferences& references) const {
  artworkTable().parse(*this, properties, object, references);
  MetadataRootFactory::parseProperties(properties, object, references);
}
void ArtworkFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                                    MXFReferencedObjects& referenced) const {
  const Artwork& artwork = artworkTable().cast(object);
  MetadataRootFactory::codeProperties(object, properties, referenced);
  artworkTable().code(artwork, properties, referenced);
}

const KLVKey& LyricsFactory::getSetKey() const {
  static const KLVKey key = testSetKey(0x06);
  return key;
}

TestModelFactory::TestModelFactory()
    : factories_{std::make_shared<AlbumFactory>(),  std::make_shared<SongFactory>(),
                 std::make_shared<LiveSongFactory>(), std::make_shared<CreditFactory>(),
                 std::make_shared<ArtworkFactory>(),  std::make_shared<LyricsFactory>()} {}

KLVKey albumDarkReferenceKey() { return testPropertyKey(0x70); }

bool DarkReferenceModelFactory::isReferenceDarkProperty(const KLVKey& setKey, const KLVKey& propertyKey) {
  return setKey == testSetKey(0x01) && propertyKey == albumDarkReferenceKey();
}

namespace {

std::string hex(const ByteVector& bytes) {
  std::ostringstream out;
  out << std::hex << std::setfill('0');
  for (std::uint8_t b : bytes) out << std::setw(2) << static_cast<unsigned>(b);
  return out.str();
}

std::string idOf(const MetadataRoot& object) {
  const ByteVector bytes(object.getInstanceUID().data(), object.getInstanceUID().data() + 16);
  return hex(bytes);
}

void describeInto(const std::shared_ptr<const MetadataRoot>& object, const std::string& indent, std::ostream& out);

void describeValues(const std::shared_ptr<const MetadataRoot>& object, const std::string& indent, std::ostream& out) {
  if (const Album* album = dynamic_cast<const Album*>(object.get())) {
    out << indent << "Album " << idOf(*album) << " version " << album->getVersion() << "\n";
    if (album->hasFavourite()) out << indent << " favourite " << idOf(*album->getFavourite()) << "\n";
    if (album->hasArtwork()) describeInto(album->getArtwork(), indent + " ", out);
    for (std::size_t i = 0; i < album->getSongCount(); ++i) describeInto(album->getSongAt(i), indent + " ", out);
  } else if (const Song* song = dynamic_cast<const Song*>(object.get())) {
    const LiveSong* live = dynamic_cast<const LiveSong*>(song);
    out << indent << (live ? "LiveSong " : "Song ") << idOf(*song) << " number " << song->getNumber();
    if (live) out << " venue " << live->getVenue();
    out << "\n";
    for (std::size_t i = 0; i < song->getCreditCount(); ++i) describeInto(song->getCreditAt(i), indent + " ", out);
  } else if (const Credit* credit = dynamic_cast<const Credit*>(object.get())) {
    out << indent << "Credit " << idOf(*credit) << " role " << static_cast<unsigned>(credit->getRole());
    if (credit->hasPerformer()) out << " performer " << idOf(*credit->getPerformer());
    out << "\n";
  } else if (const Artwork* artwork = dynamic_cast<const Artwork*>(object.get())) {
    out << indent << "Artwork " << idOf(*artwork);
    if (artwork->hasSize()) out << " size " << artwork->getSize();
    out << "\n";
  } else {
    out << indent << "object " << idOf(*object) << "\n";
  }
}

void describeInto(const std::shared_ptr<const MetadataRoot>& object, const std::string& indent, std::ostream& out) {
  describeValues(object, indent, out);
  for (const MetadataRoot::DarkProperties::value_type& dark : object->getDarkProperties()) {
    out << indent << " dark " << hex(ByteVector(dark.first.data(), dark.first.data() + 16));
    if (const ByteVector* bytes = std::get_if<ByteVector>(&dark.second)) {
      out << " = " << hex(*bytes) << "\n";
    } else {
      out << " ->\n";
      describeInto(std::get<std::shared_ptr<MetadataRoot>>(dark.second), indent + "  ", out);
    }
  }
}

}  // namespace

std::string describe(const std::shared_ptr<const MetadataRoot>& object) {
  std::ostringstream out;
  describeInto(object, "", out);
  return out.str();
}

MXFUID uidOf(std::uint8_t n) {
  std::array<std::uint8_t, 16> octets;
  octets.fill(n);
  return MXFUID(octets);
}

std::string uidText(std::uint8_t n) {
  std::ostringstream out;
  out << std::hex << std::setfill('0') << std::setw(2) << static_cast<unsigned>(n);
  const std::string pair = out.str();
  std::string text;
  for (int i = 0; i < 16; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text += "-";
    text += pair;
  }
  return text;
}

ByteVector uidBytes(std::uint8_t n) { return ByteVector(16, n); }

ByteVector uidBatch(const std::vector<std::uint8_t>& ns) {
  ByteVector bytes = uint32Bytes(static_cast<std::uint32_t>(ns.size()));
  const ByteVector itemSize = uint32Bytes(16);
  bytes.insert(bytes.end(), itemSize.begin(), itemSize.end());
  for (std::uint8_t n : ns) bytes.insert(bytes.end(), 16, n);
  return bytes;
}

ByteVector uint16Bytes(std::uint16_t value) {
  return ByteVector{static_cast<std::uint8_t>(value >> 8), static_cast<std::uint8_t>(value)};
}

ByteVector uint32Bytes(std::uint32_t value) {
  return ByteVector{static_cast<std::uint8_t>(value >> 24), static_cast<std::uint8_t>(value >> 16),
                    static_cast<std::uint8_t>(value >> 8), static_cast<std::uint8_t>(value)};
}

MXFPrimedSet primedSetOf(const KLVKey& setKey, std::uint8_t n, const MXFPropertyMap& properties) {
  MXFPrimedSet set;
  set.key = setKey;
  set.properties = properties;
  set.properties[MXFInstanceUIDKey] = uidBytes(n);
  return set;
}

std::vector<MXFPrimedSet> sampleSets() {
  return {primedSetOf(testSetKey(0x01), 0x01,
                      {{testPropertyKey(0x01), uint16Bytes(2)},
                       {testPropertyKey(0x03), uidBatch({0x02, 0x03})},
                       {testPropertyKey(0x04), uidBytes(0x06)},
                       {testPropertyKey(0x05), uidBytes(0x03)}}),
          primedSetOf(testSetKey(0x02), 0x02,
                      {{testPropertyKey(0x11), uint32Bytes(1)}, {testPropertyKey(0x12), uidBatch({0x04, 0x05})}}),
          primedSetOf(testSetKey(0x03), 0x03,
                      {{testPropertyKey(0x11), uint32Bytes(2)}, {testPropertyKey(0x21), uint16Bytes(7)}}),
          primedSetOf(testSetKey(0x04), 0x04, {{testPropertyKey(0x31), ByteVector{0x01}}}),
          primedSetOf(testSetKey(0x04), 0x05, {{testPropertyKey(0x31), ByteVector{0x02}}}),
          primedSetOf(testSetKey(0x05), 0x06, {{testPropertyKey(0x41), uint32Bytes(100)}})};
}

std::string sampleDescription() {
  return "Album 01010101010101010101010101010101 version 2\n"
         " favourite 03030303030303030303030303030303\n"
         " Artwork 06060606060606060606060606060606 size 100\n"
         " Song 02020202020202020202020202020202 number 1\n"
         "  Credit 04040404040404040404040404040404 role 1\n"
         "  Credit 05050505050505050505050505050505 role 2\n"
         " LiveSong 03030303030303030303030303030303 number 2 venue 7\n";
}

}  // namespace zelta_test
