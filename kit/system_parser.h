// The system side of the kit's reader: each system element goes to the
// parser of its kind, proxy or SDTI-CP.
#ifndef ZELTA_KIT_SYSTEM_PARSER_H
#define ZELTA_KIT_SYSTEM_PARSER_H

#include <memory>

#include "mxf.h"

class ZeltaSystemParser : public MXFGCSystemHandler {
 public:
  ZeltaSystemParser();
  ~ZeltaSystemParser() override;
  ZeltaSystemParser(const ZeltaSystemParser&) = delete;
  ZeltaSystemParser& operator=(const ZeltaSystemParser&) = delete;

  bool startSystemElement(const KLVKey& key) override;
  // "current handler is present" for an element that no parser took.
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

  void setErrorHandler(ErrorHandler* errorHandler);
  // Each makes its parser around the handler; an empty one drops the kind.
  void setSDTICPHandler(MXFSDTICPSystemHandler* handler);
  void setProxyHandler(MXFQMProxySystemHandler* handler);

 private:
  MXFGCSystemHandler& current();

  ErrorHandler* errorHandler_ = nullptr;
  std::unique_ptr<MXFSDTICPSystemParser> sdticpParser_;
  std::unique_ptr<MXFQMProxySystemParser> proxyParser_;
  MXFGCSystemHandler* current_ = nullptr;
};

#endif
