#include "mxf.h"

namespace {

// Partition pack key with kind and status left open; octet 7 is the version.
constexpr std::array<std::uint8_t, 16> partitionKeyOctets{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01,
                                                          0x0D, 0x01, 0x02, 0x01, 0x01, 0x00, 0x00, 0x00};

// Kind and status vary; the last octet must stay zero.
constexpr KLVKeyPattern partitionKeyPattern =
    KLVKeyPattern(partitionKeyOctets).withMask(13, 0x00).withMask(14, 0x00).withMask(15, 0xFF);

}  // namespace

KLVKey MXFPartitionPackKey(MXFPartitionKind kind, MXFPartitionStatus status) {
  KLVKey key(partitionKeyOctets);
  key[13] = kind;
  key[14] = status;
  check(isMXFPartitionKey(key), "valid partition key");
  return key;
}

bool isMXFPartitionKey(const KLVKey& key) {
  return partitionKeyPattern.matches(key) && key[7] != 0 && key[13] >= MXFHeaderPartition &&
         key[13] <= MXFFooterPartition && key[14] >= MXFOpenIncomplete && key[14] <= MXFClosedComplete;
}

bool isMXFRandomIndexKey(const KLVKey& key) { return key == MXFRandomIndexPackKey; }

MXFPartitionKind getMXFPartitionKind(const KLVKey& key) {
  check(isMXFPartitionKey(key), "valid partition key");
  return static_cast<MXFPartitionKind>(key[13]);
}

MXFPartitionStatus getMXFPartitionStatus(const KLVKey& key) {
  check(isMXFPartitionKey(key), "valid partition key");
  return static_cast<MXFPartitionStatus>(key[14]);
}
