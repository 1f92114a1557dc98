#include <string>

#include "kit.h"

MXFProductVersion getZeltaToolkitVersion() {
  MXFProductVersion version;
  version.major = 4;
  version.minor = 0;
  version.tertiary = 0;
  version.patch = 74;
  version.release = 1;
  return version;
}

std::wstring getZeltaPlatform() { return L"Orvane Zelta Toolkit (Linux)"; }
