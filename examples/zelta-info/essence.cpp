#include "essence.h"

#include "summary.h"

namespace zelta_info {

EssenceCollector::EssenceCollector(Essence* essence, bool md5, SystemCollector* system, ErrorHandler* errors)
    : essence_(essence), md5_(md5 && essence != nullptr), system_(system), splitter_(std::make_unique<MXFGCSplitter>(this, this, this)) {
  splitter_->setErrorHandler(errors);
  setHandler(splitter_.get());
}

EssenceCollector::~EssenceCollector() = default;

bool EssenceCollector::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                     KLVLengthType lengthType) {
  elementLength_ = length;
  return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
}

bool EssenceCollector::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  elementLength_ = length;
  return DullKLVFilter::startFixedLengthPack(key, length, buffer);
}

bool EssenceCollector::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  elementLength_ = length;
  return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
}

void EssenceCollector::start(std::uint64_t) {}

void EssenceCollector::end() {}

// Each partition's essence is a container stream of its own, so the digests
// run on until the whole file has been read.
void EssenceCollector::finish() {
  if (!essence_) return;
  for (ElementTotal& total : essence_->totals) {
    const auto digest = digests_.find(total.key);
    if (digest != digests_.end()) total.md5 = digest->second.hexDigest();
  }
  digests_.clear();
}

void EssenceCollector::startEditUnit() {
  if (system_) system_->startEditUnit();
  if (!essence_) return;
  ++essence_->editUnits;
  essence_->units.emplace_back();
}

bool EssenceCollector::startSystemElement(const KLVKey& key) {
  add("system", key, elementLength_);
  return system_ && system_->startSystemElement(key);
}

void EssenceCollector::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  system_->systemLocalSet(key, items);
}

void EssenceCollector::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  system_->systemFixedPack(key, bytes);
}

void EssenceCollector::systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) {
  system_->systemVariablePack(key, items);
}

const char* EssenceCollector::kindOf(const KLVKey& key) const {
  if (splitter_->isPictureKey(key)) return "picture";
  if (splitter_->isSoundKey(key)) return "sound";
  if (splitter_->isDataKey(key)) return "data";
  return "compound";
}

ElementTotal& EssenceCollector::total(const KLVKey& key, const std::string& kind) {
  const auto found = totalIndex_.find(key);
  if (found != totalIndex_.end()) return essence_->totals[found->second];
  totalIndex_.emplace(key, essence_->totals.size());
  essence_->totals.push_back(ElementTotal{key, kind, 0, 0, std::string()});
  if (md5_ && kind != "system") digests_.emplace(key, MD5());
  return essence_->totals.back();
}

void EssenceCollector::add(const std::string& kind, const KLVKey& key, std::uint64_t length) {
  if (!essence_) return;
  if (!essence_->units.empty()) essence_->units.back().push_back(ElementEvent{kind, key, length});
  ElementTotal& sum = total(key, kind);
  sum.count += 1;
  sum.bytes += length;
}

// The value is read straight into our buffer, whatever its size.
bool EssenceCollector::startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  if (!essence_) return false;
  add(kindOf(key), key, length);
  if (!md5_) return false;
  if (buffer_.size() < length) buffer_.resize(length);
  buffer = buffer_.data();
  return true;
}

void EssenceCollector::digest(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  const auto found = digests_.find(key);
  if (found != digests_.end() && data != nullptr) found->second.update(data, length);
}

void EssenceCollector::pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  digest(key, data, length);
}

void EssenceCollector::soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  digest(key, data, length);
}

void EssenceCollector::dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  digest(key, data, length);
}

void EssenceCollector::compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  digest(key, data, length);
}

void printEssenceText(std::ostream& out, const Essence& essence) {
  out << "essence: " << essence.editUnits << " edit units\n";
  for (std::size_t i = 0; i < essence.units.size(); ++i) {
    out << "  edit unit " << i << "\n";
    for (const ElementEvent& e : essence.units[i])
      out << "    " << e.kind << " " << label(e.key) << " " << e.length << "\n";
  }
  for (const ElementTotal& t : essence.totals) {
    out << "  " << t.kind << " " << label(t.key) << ": " << t.count << " elements, " << t.bytes << " bytes";
    if (!t.md5.empty()) out << ", md5 " << t.md5;
    out << "\n";
  }
}

void printEssenceJson(std::ostream& out, const Essence& essence) {
  out << "{\"editUnits\": " << essence.editUnits << ", \"elements\": [";
  const char* separator = "";
  for (const ElementTotal& t : essence.totals) {
    out << separator << "{\"key\": " << jsonString(label(t.key)) << ", \"kind\": " << jsonString(t.kind)
        << ", \"count\": " << t.count << ", \"bytes\": " << t.bytes;
    if (!t.md5.empty()) out << ", \"md5\": " << jsonString(t.md5);
    out << "}";
    separator = ", ";
  }
  out << "]}";
}

}  // namespace zelta_info
