// Element keys spelled out, and a splitter that tells one recording handler
// and one recording error handler everything.
#ifndef ZELTA_TESTS_ESSENCE_GC_SPLITTER_FIXTURE_H
#define ZELTA_TESTS_ESSENCE_GC_SPLITTER_FIXTURE_H

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/essence_recording.h"
#include "support/recording.h"

namespace zelta_test::gc {

// A fixed length pack of the system item, as SDTI-CP packs are.
inline KLVKey systemPackKey() { return keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00"); }
// A local set with two-octet tags and lengths.
inline KLVKey systemSetKey() { return keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00"); }
// A variable length pack with BER lengths.
inline KLVKey systemVariablePackKey() { return keyOf("06 0E 2B 34 02 04 01 01 0D 01 03 01 14 03 01 00"); }
inline KLVKey pictureKey() { return keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00"); }
inline KLVKey soundKey() { return keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 02 03 00"); }
inline KLVKey dataKey() { return keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 17 01 01 00"); }
inline KLVKey compoundKey() { return keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 18 01 01 00"); }
// Of the essence element family, but of no kind.
inline KLVKey kindlessKey() { return keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 19 01 01 00"); }
inline KLVKey fillKeyOfVersion(std::uint8_t version) {
  KLVKey key = keyOf("06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00 00");
  key[7] = version;
  return key;
}

inline std::string line(const std::string& event, const KLVKey& key) { return event + " " + toString(key); }
inline std::string line(const std::string& event, const KLVKey& key, std::uint64_t length) {
  return event + " " + toString(key) + " " + std::to_string(length);
}
inline std::string message(const std::string& text, const KLVKey& key) { return text + " - " + toString(key); }

class GCSplitterTest : public ::testing::Test {
protected:
  explicit GCSplitterTest(RecordingGCHandler::EssencePolicy policy = RecordingGCHandler::take)
      : handler(policy), splitter(&handler, &handler, &handler) {
    splitter.setErrorHandler(&errors);
  }

  void open() { splitter.startStream(true); }
  void close() { splitter.endStream(false); }
  bool essence(const KLVKey& key, const ByteVector& value = {1, 2, 3}) {
    return sendIndividualItem(splitter, key, value);
  }
  bool systemPack(const ByteVector& value = {9, 8}) { return sendFixedLengthPack(splitter, systemPackKey(), value); }

  // The events between start and end.
  std::vector<std::string> inner() const {
    return std::vector<std::string>(handler.events.begin() + 1, handler.events.end() - 1);
  }

  RecordingGCHandler handler;
  RecordingErrorHandler errors;
  MXFGCSplitter splitter;
};

}  // namespace zelta_test::gc

#endif
