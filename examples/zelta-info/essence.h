// The edit units of the generic container and its elements by key, as the
// generic container splitter delivers them.
#ifndef ZELTA_INFO_ESSENCE_H
#define ZELTA_INFO_ESSENCE_H

#include <cstdint>
#include <map>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "klv.h"
#include "md5.h"
#include "mxf.h"
#include "system.h"

namespace zelta_info {

struct ElementEvent {
  std::string kind;  // system, picture, sound, data or compound
  KLVKey key;
  std::uint64_t length = 0;
};

// Every element of one key; md5 of the concatenated values when asked for.
struct ElementTotal {
  KLVKey key;
  std::string kind;
  std::uint64_t count = 0;
  std::uint64_t bytes = 0;
  std::string md5;
};

struct Essence {
  std::uint64_t editUnits = 0;
  std::vector<std::vector<ElementEvent>> units;
  std::vector<ElementTotal> totals;  // in the order of first appearance
};

// Sits in front of the splitter: notes the length of each top-level element
// for the system element events, which carry none. Essence is noted when
// asked for; system items go on to the system collector, when there is one.
class EssenceCollector : public DullKLVFilter, public MXFGCStructureHandler, public MXFGCSystemHandler,
                         public MXFGCEssenceHandler {
public:
  EssenceCollector(Essence* essence, bool md5, SystemCollector* system, ErrorHandler* errors);
  ~EssenceCollector() override;
  // Ends the digests, after the read.
  void finish();

  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;

  void start(std::uint64_t kagSize) override;
  void end() override;
  void startEditUnit() override;
  void endEditUnit() override {}
  void startSlice() override {}
  void endSlice() override {}
  void startPaddedElement(std::uint64_t) override {}
  void endPaddedElement() override {}
  void startAlignedElement(std::uint64_t) override {}
  void endAlignedElement() override {}

  bool startSystemElement(const KLVKey& key) override;
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void essenceLengthForm(std::uint8_t) override {}

private:
  const char* kindOf(const KLVKey& key) const;
  ElementTotal& total(const KLVKey& key, const std::string& kind);
  void add(const std::string& kind, const KLVKey& key, std::uint64_t length);
  void digest(const KLVKey& key, const std::uint8_t* data, std::uint64_t length);

  Essence* essence_;
  bool md5_;
  SystemCollector* system_;
  std::unique_ptr<MXFGCSplitter> splitter_;
  std::uint64_t elementLength_ = 0;
  std::map<KLVKey, std::size_t> totalIndex_;
  std::map<KLVKey, MD5> digests_;
  std::vector<std::uint8_t> buffer_;
};

void printEssenceText(std::ostream& out, const Essence& essence);
void printEssenceJson(std::ostream& out, const Essence& essence);

}  // namespace zelta_info

#endif
