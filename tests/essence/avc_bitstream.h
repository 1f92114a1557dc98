// AVC bitstreams built field by field: Exp-Golomb codes, NAL units with
// emulation prevention, parameter sets and slice headers.
#ifndef ZELTA_TESTS_ESSENCE_AVC_BITSTREAM_H
#define ZELTA_TESTS_ESSENCE_AVC_BITSTREAM_H

#include <cstdint>
#include <vector>

#include "klv.h"

namespace zelta_test::avc {

class BitWriter {
public:
  BitWriter& bits(std::uint64_t value, unsigned count) {
    for (unsigned i = count; i-- > 0;) bit(((value >> i) & 1) != 0);
    return *this;
  }
  BitWriter& flag(bool value) {
    bit(value);
    return *this;
  }
  BitWriter& ue(std::uint64_t value) {
    const std::uint64_t code = value + 1;
    unsigned length = 0;
    while ((code >> length) > 1) ++length;
    return bits(0, length).bits(code, length + 1);
  }
  BitWriter& se(std::int64_t value) { return ue(value > 0 ? 2 * value - 1 : -2 * value); }
  // The octets so far, the last one filled with zeros.
  ByteVector octets() const { return octets_; }
  // With the stop bit and alignment.
  ByteVector rbsp() const {
    BitWriter copy = *this;
    copy.bit(true);
    while (copy.count_ % 8 != 0) copy.bit(false);
    return copy.octets_;
  }

private:
  void bit(bool value) {
    if (count_ % 8 == 0) octets_.push_back(0);
    if (value) octets_.back() = static_cast<std::uint8_t>(octets_.back() | (0x80 >> (count_ % 8)));
    ++count_;
  }
  ByteVector octets_;
  std::size_t count_ = 0;
};

// A four-octet start code, the header and the payload with emulation
// prevention.
inline ByteVector nal(unsigned refIdc, unsigned type, const ByteVector& rbsp) {
  ByteVector out{0x00, 0x00, 0x00, 0x01, static_cast<std::uint8_t>((refIdc << 5) | type)};
  unsigned zeros = 0;
  for (std::uint8_t octet : rbsp) {
    if (zeros >= 2 && octet <= 0x03) {
      out.push_back(0x03);
      zeros = 0;
    }
    out.push_back(octet);
    zeros = octet == 0 ? zeros + 1 : 0;
  }
  return out;
}

inline bool containsEmulationPrevention(const ByteVector& bytes) {
  for (std::size_t i = 2; i < bytes.size(); ++i)
    if (bytes[i] == 0x03 && bytes[i - 1] == 0 && bytes[i - 2] == 0) return true;
  return false;
}

struct SPS {
  unsigned profile = 77;
  unsigned id = 0;
  unsigned chromaFormat = 1;
  bool scalingLists = false;  // profiles with chroma fields only
  unsigned log2MaxFrameNum = 4;
  unsigned pocType = 0;
  unsigned log2MaxPocLsb = 4;
  bool deltaAlwaysZero = false;
  int offsetForNonRef = 0;
  int offsetTopToBottom = 0;
  std::vector<int> cycle;
  bool frameMbsOnly = true;
  bool vui = false;

  ByteVector bytes() const {
    BitWriter w;
    w.bits(profile, 8).bits(0, 8).bits(40, 8).ue(id);
    if (profile == 100 || profile == 110 || profile == 122 || profile == 244) {
      w.ue(chromaFormat);
      if (chromaFormat == 3) w.flag(false);
      w.ue(2).ue(2).flag(false).flag(scalingLists);
      if (scalingLists) {
        w.flag(true).se(-8);                             // list 0: the default, one delta
        w.flag(true);                                    // list 1: 16 deltas
        for (int j = 0; j < 16; ++j) w.se(j == 0 ? 4 : 0);
        w.flag(false).flag(false).flag(false).flag(false);
        w.flag(true);                                    // list 6: 64 deltas
        for (int j = 0; j < 64; ++j) w.se(j % 2 == 0 ? 3 : -3);
        for (unsigned i = 7; i < (chromaFormat != 3 ? 8u : 12u); ++i) w.flag(false);
      }
    }
    w.ue(log2MaxFrameNum - 4).ue(pocType);
    if (pocType == 0) w.ue(log2MaxPocLsb - 4);
    if (pocType == 1) {
      w.flag(deltaAlwaysZero).se(offsetForNonRef).se(offsetTopToBottom).ue(cycle.size());
      for (int offset : cycle) w.se(offset);
    }
    w.ue(4).flag(false).ue(119).ue(frameMbsOnly ? 67 : 33).flag(frameMbsOnly);
    if (!frameMbsOnly) w.flag(false);
    w.flag(true).flag(true).ue(0).ue(0).ue(0).ue(4);
    w.flag(vui);
    if (vui) {
      w.flag(true).bits(255, 8).bits(1, 16).bits(1, 16);  // extended sample aspect ratio
      w.flag(true).flag(false);                           // overscan
      w.flag(true).bits(5, 3).flag(false).flag(true).bits(0x010101, 24);
      w.flag(true).ue(0).ue(0);                                   // chroma location
      w.flag(true).bits(1, 32).bits(50, 32).flag(true);           // timing
      w.flag(true).ue(1).bits(4, 4).bits(6, 4);                   // NAL HRD, two schedules
      w.ue(1000).ue(2000).flag(false).ue(3000).ue(4000).flag(true);
      w.bits(23, 5).bits(23, 5).bits(23, 5).bits(24, 5);
      w.flag(false).flag(false).flag(false);                      // no VCL HRD, low delay, pic_struct
      w.flag(true).flag(true).ue(2).ue(1).ue(16).ue(16).ue(2).ue(4);  // restrictions
    }
    return nal(3, 7, w.rbsp());
  }
};

struct PPS {
  unsigned id = 0;
  unsigned spsId = 0;
  bool bottomFieldPicOrder = false;
  unsigned sliceGroupsMinus1 = 0;
  unsigned mapType = 0;
  unsigned refsL0Minus1 = 0;
  unsigned refsL1Minus1 = 0;
  bool weightedPred = false;
  unsigned weightedBipred = 0;
  bool redundantPicCnt = false;
  bool extension = false;  // transform_8x8_mode_flag and scaling lists
  unsigned scalingLists = 8;  // 12 for chroma_format_idc 3

  ByteVector bytes() const {
    BitWriter w;
    w.ue(id).ue(spsId).flag(true).flag(bottomFieldPicOrder).ue(sliceGroupsMinus1);
    if (sliceGroupsMinus1 > 0) {
      w.ue(mapType);
      if (mapType == 0)
        for (unsigned g = 0; g <= sliceGroupsMinus1; ++g) w.ue(10);
      if (mapType == 2)
        for (unsigned g = 0; g < sliceGroupsMinus1; ++g) w.ue(1).ue(30);
      if (mapType >= 3 && mapType <= 5) w.flag(true).ue(3);
      if (mapType == 6) {
        w.ue(9);
        for (int unit = 0; unit < 10; ++unit) w.bits(unit % 2, 2);
      }
    }
    w.ue(refsL0Minus1).ue(refsL1Minus1).flag(weightedPred).bits(weightedBipred, 2);
    w.se(0).se(0).se(-2).flag(true).flag(false).flag(redundantPicCnt);
    if (extension) {
      w.flag(true).flag(true);
      for (unsigned i = 0; i < scalingLists; ++i) w.flag(i + 1 == scalingLists);
      for (int j = 0; j < 64; ++j) w.se(1);
      w.se(-2);
    }
    return nal(3, 8, w.rbsp());
  }
};

// One slice of I 2 or 7, P 0 or 5, B 1 or 6; after the header, some octets
// of slice data.
struct Slice {
  unsigned type = 7;
  unsigned ppsId = 0;
  unsigned frameNum = 0;
  bool field = false;
  bool bottom = false;
  unsigned pocLsb = 0;
  int deltaBottom = 0;
  int delta0 = 0;
  int delta1 = 0;
  // Operations with their arguments, each operation first.
  std::vector<std::vector<unsigned>> operations;
  bool overrideRefs = false;
  bool modifications = false;

  ByteVector bytes(const SPS& sps, const PPS& pps, bool idr, unsigned refIdc) const {
    BitWriter w;
    w.ue(0).ue(type).ue(ppsId).bits(frameNum, sps.log2MaxFrameNum);
    if (!sps.frameMbsOnly) {
      w.flag(field);
      if (field) w.flag(bottom);
    }
    if (idr) w.ue(1);
    if (sps.pocType == 0) {
      w.bits(pocLsb, sps.log2MaxPocLsb);
      if (pps.bottomFieldPicOrder && !field) w.se(deltaBottom);
    }
    if (sps.pocType == 1 && !sps.deltaAlwaysZero) {
      w.se(delta0);
      if (pps.bottomFieldPicOrder && !field) w.se(delta1);
    }
    if (pps.redundantPicCnt) w.ue(0);
    const unsigned kind = type % 5;
    if (kind == 1) w.flag(true);
    if (kind == 0 || kind == 1 || kind == 3) {
      w.flag(overrideRefs);
      if (overrideRefs) {
        w.ue(1);
        if (kind == 1) w.ue(1);
      }
    }
    const unsigned lists = kind == 1 ? 2 : (kind == 2 || kind == 4 ? 0 : 1);
    for (unsigned list = 0; list < lists; ++list) {
      w.flag(modifications);
      if (modifications) w.ue(0).ue(4).ue(2).ue(1).ue(4).ue(3);
    }
    const unsigned refs[2] = {overrideRefs ? 2 : pps.refsL0Minus1 + 1, overrideRefs ? 2 : pps.refsL1Minus1 + 1};
    if ((pps.weightedPred && (kind == 0 || kind == 3)) || (pps.weightedBipred == 1 && kind == 1)) {
      w.ue(5).ue(5);
      for (unsigned list = 0; list < (kind == 1 ? 2u : 1u); ++list)
        for (unsigned r = 0; r < refs[list]; ++r) {
          w.flag(r != 1);
          if (r != 1) w.se(3).se(-3);
          w.flag(r == 0);
          if (r == 0) w.se(1).se(-1).se(2).se(-2);
        }
    }
    if (refIdc != 0) {
      if (idr) {
        w.flag(false).flag(false);
      } else {
        w.flag(!operations.empty());
        for (const std::vector<unsigned>& operation : operations)
          for (unsigned value : operation) w.ue(value);
        if (!operations.empty()) w.ue(0);
      }
    }
    w.bits(0xA5F00F5A, 32);  // slice data
    return nal(refIdc, idr ? 5 : 1, w.rbsp());
  }
};

inline ByteVector delimiter(unsigned primaryPicType) { return nal(0, 9, BitWriter().bits(primaryPicType, 3).rbsp()); }

inline ByteVector joined(const std::vector<ByteVector>& parts) {
  ByteVector out;
  for (const ByteVector& part : parts) out.insert(out.end(), part.begin(), part.end());
  return out;
}

}  // namespace zelta_test::avc

#endif
