// Writes seed inputs for zelta_essence_fuzz from real files, in its record
// form, so that the fuzzer starts from true pictures and system items:
//   essence_seeds DIRECTORY mpeg2|avc|system FILE...
// Each file gives one seed of its first pictures, or of its first system
// elements; pictures are cut to what a record holds.

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <iostream>
#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace {

constexpr std::size_t maximumRecords = 12;
constexpr std::size_t maximumRecordLength = 0xFFFF;

class Seed {
public:
  bool full() const { return records_ >= maximumRecords; }
  void add(std::uint8_t kind, const std::uint8_t* data, std::size_t length) {
    if (full()) return;
    if (length > maximumRecordLength) length = maximumRecordLength;
    octets_.push_back(kind);
    octets_.push_back(static_cast<char>(length >> 8));
    octets_.push_back(static_cast<char>(length & 0xFF));
    octets_.append(reinterpret_cast<const char*>(data), length);
    ++records_;
  }
  bool empty() const { return records_ == 0; }
  void write(const std::string& path, std::uint8_t chooser) const {
    std::ofstream out(path, std::ios::binary);
    out.put(static_cast<char>(chooser));
    out << octets_;
  }

private:
  std::string octets_;
  std::size_t records_ = 0;
};

class Pictures : public DullMXFGCEssenceHandler {
public:
  explicit Pictures(Seed& seed) : seed_(seed) {}
  bool startEssenceElement(const KLVKey& key, std::uint64_t, std::uint8_t*&) override {
    return key == MXFMPEGPictureElementKey && !seed_.full();
  }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    seed_.add(0, data, static_cast<std::size_t>(length));
  }

private:
  Seed& seed_;
};

// The record kinds of the fuzz target: the event in bits 0 and 1, a local set
// coding in bit 2, octets 14 and 15 of the key in bits 3 to 7.
class SystemItems : public MXFGCSystemHandler {
public:
  explicit SystemItems(Seed& seed) : seed_(seed) {}
  bool startSystemElement(const KLVKey& key) override {
    seed_.add(kind(key, 0), nullptr, 0);
    return !seed_.full();
  }
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override {
    seed_.add(kind(key, 1), bytes.data(), bytes.size());
  }
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override {
    ByteVector octets;
    for (const auto& [tag, value] : items) {
      const std::size_t length = std::min<std::size_t>(value.size(), 0xFF);
      octets.insert(octets.end(), {static_cast<std::uint8_t>(tag >> 8), static_cast<std::uint8_t>(tag & 0xFF),
                                   static_cast<std::uint8_t>(length)});
      octets.insert(octets.end(), value.begin(), value.begin() + static_cast<std::ptrdiff_t>(length));
    }
    seed_.add(kind(key, 2), octets.data(), octets.size());
  }
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems&) override { seed_.add(kind(key, 3), nullptr, 0); }

private:
  static std::uint8_t kind(const KLVKey& key, std::uint8_t event) {
    return static_cast<std::uint8_t>(event | (key[5] == 0x43 ? 0x04 : 0) | (key[14] & 0x07) << 3 |
                                     (key[15] & 0x03) << 6);
  }
  Seed& seed_;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc < 4) {
    std::cerr << "usage: essence_seeds DIRECTORY mpeg2|avc|system FILE...\n";
    return 2;
  }
  const std::string directory = argv[1];
  const std::string kind = argv[2];
  if (kind != "mpeg2" && kind != "avc" && kind != "system") {
    std::cerr << "essence_seeds: unknown kind " << kind << "\n";
    return 2;
  }
  for (int i = 3; i < argc; ++i) {
    std::ifstream in(argv[i], std::ios::binary);
    if (!in) {
      std::cerr << "essence_seeds: cannot open " << argv[i] << "\n";
      return 1;
    }
    Seed seed;
    Pictures pictures(seed);
    SystemItems system(seed);
    MXFGCSplitter splitter(nullptr, kind == "system" ? &system : nullptr, kind == "system" ? nullptr : &pictures);
    MXFReader reader;
    reader.setEssenceHandler(&splitter);
    reader.read(in);
    if (seed.empty()) continue;
    // The fuzz target's chooser: 0 MPEG-2, 1 AVC flushed at the end, 2 SDTI-CP, 3 proxy.
    const std::uint8_t chooser = kind == "mpeg2" ? 0 : kind == "avc" ? 0x81 : 2;
    seed.write(directory + "/" + kind + "-" + std::to_string(i), chooser);
  }
  return 0;
}
