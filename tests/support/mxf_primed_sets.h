// Header metadata spelled by hand, and a metadata handler that writes down
// what it hears.
#ifndef ZELTA_TESTS_SUPPORT_MXF_PRIMED_SETS_H
#define ZELTA_TESTS_SUPPORT_MXF_PRIMED_SETS_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace zelta_test {

// Writes each event as one line ("start", "primer 3", "acceptSet <key>",
// "primedSet <key> 2", "end") and keeps primers and sets.
class RecordingMetadataHandler : public MXFMetadataHandler {
 public:
  explicit RecordingMetadataHandler(bool accept = true) : accept_(accept) {}

  void start() override;
  void end() override;
  void primer(const MXFPrimerEntries& entries) override;
  bool acceptSet(const KLVKey& key) override;
  void primedSet(const MXFPrimedSet& set) override;

  std::vector<std::string> events;
  std::vector<MXFPrimerEntries> primers;
  std::vector<MXFPrimedSet> sets;

 private:
  bool accept_;
};

// One spelled primer entry: "3C 0A" and a key "06 0E ...".
struct SpelledEntry {
  std::string tag;
  std::string key;
};

// The value of a primer pack: count, entry size, and each entry followed by
// entrySize - 18 octets of 0xEE.
ByteVector primerValue(const std::vector<SpelledEntry>& entries, std::uint32_t entrySize = 18);
// The whole pack, with a four-octet BER length.
ByteVector primerPack(const ByteVector& value);

typedef std::vector<std::pair<std::uint16_t, ByteVector>> SpelledItems;
// A local set with two-octet tags and lengths, its own length in four
// octets.
ByteVector twoOctetSet(const KLVKey& key, const SpelledItems& items);
// A local set with two-octet tags and BER item lengths of the given form.
ByteVector berItemSet(const KLVKey& key, const SpelledItems& items, std::uint8_t itemForm);

// Keys used by the spelled streams.
KLVKey identificationKey();     // a set key with 0x53 in octet 5
KLVKey berIdentificationKey();  // the same with 0x13

}  // namespace zelta_test

#endif
