#include "system.h"

#include <cstdio>

#include "summary.h"

namespace zelta_info {

namespace {

// Upper-case digits with a blank between octets, as dumps print stamps.
template <typename Octets>
std::string octets(const Octets& values) {
  std::string text;
  for (std::uint8_t value : values) {
    char digits[4];
    std::snprintf(digits, sizeof digits, "%s%02X", text.empty() ? "" : " ", static_cast<unsigned>(value));
    text += digits;
  }
  return text;
}

std::string hex(unsigned value, int digits) {
  char text[16];
  std::snprintf(text, sizeof text, "0x%0*X", digits, value);
  return text;
}

void printItemsJson(std::ostream& out, const MXFGCLocalItems& items) {
  out << "[";
  for (std::size_t i = 0; i < items.size(); ++i)
    out << (i ? ", " : "") << "{\"tag\": " << items[i].first << ", \"value\": " << jsonString(octets(items[i].second))
        << "}";
  out << "]";
}

void printPackJson(std::ostream& out, const MXFSDTICPSystemMetadata& pack) {
  out << "{\"bitmap\": " << unsigned(pack.bitmap) << ", \"rate\": " << unsigned(pack.rate)
      << ", \"type\": " << unsigned(pack.type) << ", \"channelHandle\": " << pack.channelHandle
      << ", \"continuityCount\": " << pack.continuityCount << ", \"label\": " << jsonString(label(pack.label))
      << ", \"creationStamp\": " << jsonString(octets(pack.creationStamp))
      << ", \"userStamp\": " << jsonString(octets(pack.userStamp)) << "}";
}

}  // namespace

SystemCollector::SystemCollector(SystemItems& items, ErrorHandler* errors)
    : items_(items), sdticp_(this), proxy_(this) {
  sdticp_.setErrorHandler(errors);
  proxy_.setErrorHandler(errors);
}

void SystemCollector::startEditUnit() { items_.units.emplace_back(); }

SystemUnit& SystemCollector::unit() {
  if (items_.units.empty()) items_.units.emplace_back();
  return items_.units.back();
}

bool SystemCollector::startSystemElement(const KLVKey& key) {
  current_ = MXFQMProxySystemElementPattern.matches(key) ? static_cast<MXFGCSystemHandler*>(&proxy_) : &sdticp_;
  return current_->startSystemElement(key);
}

void SystemCollector::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  current_->systemLocalSet(key, items);
}

void SystemCollector::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  current_->systemFixedPack(key, bytes);
}

void SystemCollector::systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) {
  current_->systemVariablePack(key, items);
}

void SystemCollector::systemMetadata(const MXFSDTICPSystemMetadata& pack) { unit().packs.push_back(pack); }

void SystemCollector::addSet(const char* kind, const MXFGCLocalItems& items) {
  unit().sets.push_back(SystemSet{kind, items});
}

void SystemCollector::packageMetadata(const MXFGCLocalItems& items) { addSet("package", items); }

void SystemCollector::pictureMetadata(const MXFGCLocalItems& items) { addSet("picture", items); }

void SystemCollector::soundMetadata(const MXFGCLocalItems& items) { addSet("sound", items); }

void SystemCollector::dataMetadata(const MXFGCLocalItems& items) { addSet("data", items); }

void SystemCollector::controlData(std::uint16_t tag, const ByteVector& bytes) { addSet("control", {{tag, bytes}}); }

void SystemCollector::proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) {
  unit().proxies.push_back(ProxySystem{frameCount, timecodes});
}

void printSystemText(std::ostream& out, const SystemItems& items) {
  out << "system: " << items.units.size() << " edit units\n";
  for (std::size_t i = 0; i < items.units.size(); ++i) {
    const SystemUnit& unit = items.units[i];
    out << "  edit unit " << i << "\n";
    for (const MXFSDTICPSystemMetadata& pack : unit.packs)
      out << "    pack bitmap " << hex(pack.bitmap, 2) << " rate " << hex(pack.rate, 2) << " type "
          << hex(pack.type, 2) << " channel handle " << pack.channelHandle << " continuity count "
          << pack.continuityCount << "\n      label " << label(pack.label) << "\n      creation stamp "
          << octets(pack.creationStamp) << "\n      user stamp " << octets(pack.userStamp) << "\n";
    for (const SystemSet& set : unit.sets) {
      out << "    " << set.kind << " " << (set.kind == "control" ? "data" : "metadata") << ": " << set.items.size()
          << " items\n";
      for (const auto& [tag, value] : set.items) out << "      " << hex(tag, 2) << " " << octets(value) << "\n";
    }
    for (const ProxySystem& proxy : unit.proxies) {
      out << "    proxy frameCount " << proxy.frameCount << "\n";
      for (const MXFQMProxyTimecode& timecode : proxy.timecodes) out << "      timecode " << octets(timecode) << "\n";
    }
  }
}

void printSystemJson(std::ostream& out, const SystemItems& items) {
  out << "{\"editUnits\": [";
  for (std::size_t i = 0; i < items.units.size(); ++i) {
    const SystemUnit& unit = items.units[i];
    out << (i ? ", " : "") << "{\"packs\": [";
    for (std::size_t p = 0; p < unit.packs.size(); ++p) {
      out << (p ? ", " : "");
      printPackJson(out, unit.packs[p]);
    }
    out << "], \"sets\": [";
    for (std::size_t s = 0; s < unit.sets.size(); ++s) {
      out << (s ? ", " : "") << "{\"kind\": " << jsonString(unit.sets[s].kind) << ", \"items\": ";
      printItemsJson(out, unit.sets[s].items);
      out << "}";
    }
    out << "], \"proxy\": [";
    for (std::size_t p = 0; p < unit.proxies.size(); ++p) {
      out << (p ? ", " : "") << "{\"frameCount\": " << unit.proxies[p].frameCount << ", \"timecodes\": [";
      for (std::size_t t = 0; t < unit.proxies[p].timecodes.size(); ++t)
        out << (t ? ", " : "") << jsonString(octets(unit.proxies[p].timecodes[t]));
      out << "]}";
    }
    out << "]}";
  }
  out << "]}";
}

}  // namespace zelta_info
