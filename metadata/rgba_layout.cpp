#include "metadata/rgba_layout.h"

#include <cstddef>
#include <cstdint>
#include <iterator>

namespace {

constexpr std::size_t layoutSize = 16;

}  // namespace

void internalize(std::istream& in, RGBALayout& v) {
  const ByteVector octets{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  check(octets.size() == layoutSize, "valid size");
  for (std::size_t i = 0; i < v.components.size(); ++i) {
    v.components[i].code = octets[2 * i];
    v.components[i].depth = octets[2 * i + 1];
  }
}

void externalize(std::ostream& out, const RGBALayout& v) {
  for (const RGBALayout::Component& component : v.components) {
    util::putOctet(out, component.code);
    util::putOctet(out, component.depth);
  }
}
