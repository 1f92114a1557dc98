// zelta-info --validate: the file read again through the kit's reader with
// every handler that its validators stand in front of, so that they check
// the whole file; their findings join the other reports.
#ifndef ZELTA_INFO_VALIDATE_H
#define ZELTA_INFO_VALIDATE_H

#include <string>

#include "klv.h"

namespace zelta_info {

void validateFile(const std::string& path, ErrorHandler& reports);

}  // namespace zelta_info

#endif
