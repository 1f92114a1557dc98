// The system items of the generic container, per edit unit, as the SDTI-CP
// and proxy system parsers deliver them.
#ifndef ZELTA_INFO_SYSTEM_H
#define ZELTA_INFO_SYSTEM_H

#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

#include "mxf.h"

namespace zelta_info {

// One metadata set or the control data of an SDTI-CP system item.
struct SystemSet {
  std::string kind;  // package, picture, sound, data or control
  MXFGCLocalItems items;
};

struct ProxySystem {
  std::uint32_t frameCount = 0;
  std::vector<MXFQMProxyTimecode> timecodes;
};

struct SystemUnit {
  std::vector<MXFSDTICPSystemMetadata> packs;
  std::vector<SystemSet> sets;
  std::vector<ProxySystem> proxies;
};

struct SystemItems {
  std::vector<SystemUnit> units;
};

// Gives each system element to the proxy parser or the SDTI-CP parser, by
// its key, and keeps what they deliver under the current edit unit.
class SystemCollector : public MXFGCSystemHandler, public MXFSDTICPSystemHandler, public MXFQMProxySystemHandler {
public:
  SystemCollector(SystemItems& items, ErrorHandler* errors);

  void startEditUnit();

  bool startSystemElement(const KLVKey& key) override;
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override;
  void packageMetadata(const MXFGCLocalItems& items) override;
  void pictureMetadata(const MXFGCLocalItems& items) override;
  void soundMetadata(const MXFGCLocalItems& items) override;
  void dataMetadata(const MXFGCLocalItems& items) override;
  void controlData(std::uint16_t tag, const ByteVector& bytes) override;

  void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) override;

private:
  SystemUnit& unit();
  void addSet(const char* kind, const MXFGCLocalItems& items);

  SystemItems& items_;
  MXFSDTICPSystemParser sdticp_;
  MXFQMProxySystemParser proxy_;
  MXFGCSystemHandler* current_ = nullptr;
};

void printSystemText(std::ostream& out, const SystemItems& items);
void printSystemJson(std::ostream& out, const SystemItems& items);

}  // namespace zelta_info

#endif
