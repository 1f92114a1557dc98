// Handlers of the generic-container events that write down what they hear,
// one line of text per event, and keep the essence they receive.
#ifndef ZELTA_TESTS_SUPPORT_ESSENCE_RECORDING_H
#define ZELTA_TESTS_SUPPORT_ESSENCE_RECORDING_H

#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace zelta_test {

// Octets as two-digit upper-case hexadecimal joined by blanks.
std::string hexOf(const ByteVector& bytes);

// Lines: "start 0", "end", "startEditUnit", "endEditUnit" (and the writing
// events by name with their argument); "startSystemElement <key>",
// "systemLocalSet <key> <tag>=<hex>;...", "systemFixedPack <key> <hex>",
// "systemVariablePack <key> <hex>;..."; "essenceLengthForm 0x83",
// "startEssenceElement <key> <length>", "pictureElement <key> <length>"
// (sound, data, compound alike).
class RecordingGCHandler : public MXFGCStructureHandler, public MXFGCSystemHandler, public MXFGCEssenceHandler {
 public:
  enum EssencePolicy {
    decline,        // startEssenceElement answers false
    take,           // true, with no buffer: the splitter's own buffer is used
    takeIntoBuffer  // true, into a buffer of the handler's, one per element
  };

  explicit RecordingGCHandler(EssencePolicy essencePolicy = take, bool wantSystem = true)
      : essencePolicy(essencePolicy), wantSystem(wantSystem) {}

  void start(std::uint64_t kagSize) override;
  void end() override;
  void startEditUnit() override;
  void endEditUnit() override;
  void startSlice() override;
  void endSlice() override;
  void startPaddedElement(std::uint64_t paddedLength) override;
  void endPaddedElement() override;
  void startAlignedElement(std::uint64_t alignment) override;
  void endAlignedElement() override;

  bool startSystemElement(const KLVKey& key) override;
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void essenceLengthForm(std::uint8_t form) override;

  // A delivered essence element: where its octets were and, when there were
  // any, a copy of them.
  struct Element {
    std::string kind;
    KLVKey key;
    const std::uint8_t* data = nullptr;
    std::uint64_t length = 0;
    ByteVector bytes;
  };

  EssencePolicy essencePolicy;
  bool wantSystem;
  std::vector<std::string> events;
  std::vector<Element> elements;
  // The value of each fixed pack delivered.
  std::vector<ByteVector> fixedPacks;
  // With takeIntoBuffer: the buffers handed out, in order; each lives as
  // long as the handler.
  std::vector<std::vector<std::uint8_t>> buffers;

 private:
  void element(const char* kind, const KLVKey& key, const std::uint8_t* data, std::uint64_t length);
};

// One line per SDTI-CP event ("systemMetadata <continuity count>",
// "packageMetadata tag=octets;...", "controlData tag=octets"); the packs are
// kept whole.
class RecordingSDTICPHandler : public MXFSDTICPSystemHandler {
 public:
  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override;
  void packageMetadata(const MXFGCLocalItems& items) override;
  void pictureMetadata(const MXFGCLocalItems& items) override;
  void soundMetadata(const MXFGCLocalItems& items) override;
  void dataMetadata(const MXFGCLocalItems& items) override;
  void controlData(std::uint16_t tag, const ByteVector& bytes) override;

  std::vector<std::string> events;
  std::vector<MXFSDTICPSystemMetadata> packs;
};

// Events as GenericKLVReader sends them: the value is put into a buffer that
// the start event gave and announced there in one event, or else announced
// from the caller's octets (not at all when empty). Each answers what the
// start event answered.
bool sendIndividualItem(KLVHandler& handler, const KLVKey& key, const ByteVector& value);
bool sendFixedLengthPack(KLVHandler& handler, const KLVKey& key, const ByteVector& value);
// Items with two-octet tags and lengths.
bool sendLocalSet(KLVHandler& handler, const KLVKey& key, const MXFGCLocalItems& items);
bool sendVariableLengthPack(KLVHandler& handler, const KLVKey& key, const MXFGCVariableItems& items);

}  // namespace zelta_test

#endif
