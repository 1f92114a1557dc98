#include <uuid/uuid.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <istream>
#include <ostream>

#include "klv.h"

namespace {

constexpr std::size_t basicUMIDSize = 32;
constexpr std::size_t extendedUMIDSize = 64;

// The fixed head of every material number that this library makes.
constexpr std::array<std::uint8_t, 10> umidLabel{0x06, 0x0A, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x05, 0x01, 0x01};
constexpr std::size_t umidMaterialTypeOctet = 10;
constexpr std::size_t umidCreationMethodOctet = 11;
constexpr std::size_t umidLengthOctet = 12;
constexpr std::size_t umidMaterialNumberOctet = 16;
constexpr std::uint8_t umidCreationMethod = 0x23;
constexpr std::uint8_t umidBasicLength = 0x13;
constexpr std::uint8_t umidExtendedLength = 0x33;

std::size_t umidSize(UMID::Kind kind) { return kind == UMID::extended ? extendedUMIDSize : basicUMIDSize; }

void newUUID(std::uint8_t* octets) {
  uuid_t uuid;
  uuid_generate(uuid);
  std::copy(uuid, uuid + sizeof(uuid_t), octets);
}

void readOctets(std::istream& in, std::uint8_t* octets, std::streamsize n, const char* text) {
  in.read(reinterpret_cast<char*>(octets), n);
  check(in.gcount() == n, text);
}

}  // namespace

MXFUIDGenerator::~MXFUIDGenerator() = default;

MXFUID ZeltaDefaultUIDGenerator::generate() {
  MXFUID uid;
  newUUID(uid.data());
  return uid;
}

UMID::UMID() : kind(basic), octets(basicUMIDSize, 0) {}

UMID::UMID(Kind k, const ByteVector& bytes) : kind(k), octets(bytes) {
  check(octets.size() == umidSize(kind), "valid size");
}

UMID UMID::createNew(std::uint8_t materialType, Kind kind) {
  ByteVector octets(umidSize(kind), 0);
  std::copy(umidLabel.begin(), umidLabel.end(), octets.begin());
  octets[umidMaterialTypeOctet] = materialType;
  octets[umidCreationMethodOctet] = umidCreationMethod;
  octets[umidLengthOctet] = kind == extended ? umidExtendedLength : umidBasicLength;
  newUUID(octets.data() + umidMaterialNumberOctet);
  return UMID(kind, octets);
}

void internalize(std::istream& in, UMID& v) {
  ByteVector octets(extendedUMIDSize);
  readOctets(in, octets.data(), basicUMIDSize, "successful read()");
  if (in.peek() == std::istream::traits_type::eof()) {
    octets.resize(basicUMIDSize);
    v = UMID(UMID::basic, octets);
    return;
  }
  readOctets(in, octets.data() + basicUMIDSize, extendedUMIDSize - basicUMIDSize, "valid size");
  v = UMID(UMID::extended, octets);
}

void externalize(std::ostream& out, const UMID& v) {
  check(v.octets.size() == umidSize(v.kind), "valid size");
  out.write(reinterpret_cast<const char*>(v.octets.data()), static_cast<std::streamsize>(v.octets.size()));
}
