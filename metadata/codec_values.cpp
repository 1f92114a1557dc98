#include "metadata/codec_values.h"

#include <limits>

void internalize(std::istream& in, AES3ChannelStatusData& v) { util::getOctets(in, v.octets.data(), v.octets.size()); }

void externalize(std::ostream& out, const AES3ChannelStatusData& v) {
  for (const std::uint8_t octet : v.octets) util::putOctet(out, octet);
}

void internalize(std::istream& in, AVCParameterSetArray& v) {
  std::uint32_t count = 0;
  internalize(in, count);
  v.parameterSets.clear();
  for (std::uint32_t i = 0; i < count; ++i) {
    ByteVector parameterSet(util::getOctet(in));
    if (!parameterSet.empty()) util::getOctets(in, parameterSet.data(), parameterSet.size());
    v.parameterSets.push_back(std::move(parameterSet));
  }
}

void externalize(std::ostream& out, const AVCParameterSetArray& v) {
  externalize(out, static_cast<std::uint32_t>(v.parameterSets.size()));
  for (const ByteVector& parameterSet : v.parameterSets) {
    check(parameterSet.size() <= std::numeric_limits<std::uint8_t>::max(), "valid parameter set");
    util::putOctet(out, static_cast<std::uint8_t>(parameterSet.size()));
    out.write(reinterpret_cast<const char*>(parameterSet.data()), static_cast<std::streamsize>(parameterSet.size()));
  }
}
