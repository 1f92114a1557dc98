#include "support/essence_recording.h"

#include <cstdio>
#include <cstring>

#include "support/recording.h"

namespace zelta_test {

std::string hexOf(const ByteVector& bytes) {
  std::string out;
  char digits[4];
  for (std::uint8_t octet : bytes) {
    std::snprintf(digits, sizeof digits, "%02X", octet);
    if (!out.empty()) out += ' ';
    out += digits;
  }
  return out;
}

void RecordingGCHandler::start(std::uint64_t kagSize) { events.push_back("start " + std::to_string(kagSize)); }
void RecordingGCHandler::end() { events.push_back("end"); }
void RecordingGCHandler::startEditUnit() { events.push_back("startEditUnit"); }
void RecordingGCHandler::endEditUnit() { events.push_back("endEditUnit"); }
void RecordingGCHandler::startSlice() { events.push_back("startSlice"); }
void RecordingGCHandler::endSlice() { events.push_back("endSlice"); }
void RecordingGCHandler::startPaddedElement(std::uint64_t paddedLength) {
  events.push_back("startPaddedElement " + std::to_string(paddedLength));
}
void RecordingGCHandler::endPaddedElement() { events.push_back("endPaddedElement"); }
void RecordingGCHandler::startAlignedElement(std::uint64_t alignment) {
  events.push_back("startAlignedElement " + std::to_string(alignment));
}
void RecordingGCHandler::endAlignedElement() { events.push_back("endAlignedElement"); }

bool RecordingGCHandler::startSystemElement(const KLVKey& key) {
  events.push_back("startSystemElement " + toString(key));
  return wantSystem;
}

void RecordingGCHandler::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  std::string line = "systemLocalSet " + toString(key) + " ";
  for (const auto& item : items) {
    char tag[8];
    std::snprintf(tag, sizeof tag, "%04X", item.first);
    line += std::string(tag) + "=" + hexOf(item.second) + ";";
  }
  events.push_back(line);
}

void RecordingGCHandler::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  events.push_back("systemFixedPack " + toString(key) + " " + hexOf(bytes));
  fixedPacks.push_back(bytes);
}

void RecordingGCHandler::systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) {
  std::string line = "systemVariablePack " + toString(key) + " ";
  for (const ByteVector& item : items) line += hexOf(item) + ";";
  events.push_back(line);
}

bool RecordingGCHandler::startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  events.push_back("startEssenceElement " + toString(key) + " " + std::to_string(length));
  if (essencePolicy == takeIntoBuffer) {
    buffers.emplace_back(length);
    buffer = buffers.back().data();
  }
  return essencePolicy != decline;
}

void RecordingGCHandler::element(const char* kind, const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  events.push_back(std::string(kind) + "Element " + toString(key) + " " + std::to_string(length));
  Element e{kind, key, data, length, ByteVector()};
  if (data) e.bytes.assign(data, data + length);
  elements.push_back(e);
}

void RecordingGCHandler::pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  element("picture", key, data, length);
}
void RecordingGCHandler::soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  element("sound", key, data, length);
}
void RecordingGCHandler::dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  element("data", key, data, length);
}
void RecordingGCHandler::compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  element("compound", key, data, length);
}

void RecordingGCHandler::essenceLengthForm(std::uint8_t form) {
  char line[32];
  std::snprintf(line, sizeof line, "essenceLengthForm 0x%02X", form);
  events.push_back(line);
}

namespace {

// The value of an element that was taken, as the reader delivers it.
void deliverValue(KLVHandler& handler, std::uint8_t* buffer, const ByteVector& value) {
  const auto size = static_cast<std::streamsize>(value.size());
  if (buffer) {
    if (!value.empty()) std::memcpy(buffer, value.data(), value.size());
    handler.value(buffer, size);
  } else if (!value.empty()) {
    handler.value(value.data(), size);
  }
}

}  // namespace

bool sendIndividualItem(KLVHandler& handler, const KLVKey& key, const ByteVector& value) {
  std::uint8_t* buffer = nullptr;
  const bool taken = handler.startIndividualItem(key, value.size(), buffer);
  if (taken) deliverValue(handler, buffer, value);
  handler.endIndividualItem(key);
  return taken;
}

bool sendFixedLengthPack(KLVHandler& handler, const KLVKey& key, const ByteVector& value) {
  std::uint8_t* buffer = nullptr;
  const bool taken = handler.startFixedLengthPack(key, value.size(), buffer);
  if (taken) deliverValue(handler, buffer, value);
  handler.endFixedLengthPack(key);
  return taken;
}

bool sendLocalSet(KLVHandler& handler, const KLVKey& key, const MXFGCLocalItems& items) {
  std::uint64_t length = 0;
  for (const auto& item : items) length += 4 + item.second.size();
  const bool taken = handler.startLocalSet(key, length, KLVTagType2, KLVLengthType2);
  if (taken) {
    for (const auto& item : items) {
      std::uint8_t* buffer = nullptr;
      if (handler.startLocalItem(item.first, item.second.size(), buffer)) deliverValue(handler, buffer, item.second);
      handler.endLocalItem(item.first);
    }
  }
  handler.endLocalSet(key);
  return taken;
}

bool sendVariableLengthPack(KLVHandler& handler, const KLVKey& key, const MXFGCVariableItems& items) {
  std::uint64_t length = 0;
  for (const ByteVector& item : items) length += 4 + item.size();
  const bool taken = handler.startVariableLengthPack(key, length, KLVLengthTypeBER);
  if (taken) {
    for (const ByteVector& item : items) {
      std::uint8_t* buffer = nullptr;
      if (handler.startVariableLengthItem(item.size(), buffer)) deliverValue(handler, buffer, item);
      handler.endVariableLengthItem();
    }
  }
  handler.endVariableLengthPack(key);
  return taken;
}

namespace {

// " tag=octets;tag=octets;", tags in decimal; nothing for no items.
std::string itemsText(const MXFGCLocalItems& items) {
  std::string text;
  for (const auto& [tag, bytes] : items) text += std::to_string(tag) + "=" + hexOf(bytes) + ";";
  return text.empty() ? text : " " + text;
}

}  // namespace

void RecordingSDTICPHandler::systemMetadata(const MXFSDTICPSystemMetadata& pack) {
  events.push_back("systemMetadata " + std::to_string(pack.continuityCount));
  packs.push_back(pack);
}
void RecordingSDTICPHandler::packageMetadata(const MXFGCLocalItems& items) {
  events.push_back("packageMetadata" + itemsText(items));
}
void RecordingSDTICPHandler::pictureMetadata(const MXFGCLocalItems& items) {
  events.push_back("pictureMetadata" + itemsText(items));
}
void RecordingSDTICPHandler::soundMetadata(const MXFGCLocalItems& items) {
  events.push_back("soundMetadata" + itemsText(items));
}
void RecordingSDTICPHandler::dataMetadata(const MXFGCLocalItems& items) {
  events.push_back("dataMetadata" + itemsText(items));
}
void RecordingSDTICPHandler::controlData(std::uint16_t tag, const ByteVector& bytes) {
  events.push_back("controlData " + std::to_string(tag) + "=" + hexOf(bytes));
}

}  // namespace zelta_test
