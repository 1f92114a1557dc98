// zelta-info --master: the forty-one values of the clip's master metadata,
// collapsed from the model of the header metadata.
#ifndef ZELTA_INFO_MASTER_H
#define ZELTA_INFO_MASTER_H

#include <ostream>
#include <string>

#include "model.h"

namespace zelta_info {

struct Master {
  bool present = false;  // the file had a model to collapse
  std::string failure;   // the condition that the model broke; empty when collapsed
  NamedValues values;    // in the order of the master's operations
};

Master extractMaster(const Model& model);

void printMasterText(std::ostream& out, const Master& master);
void printMasterJson(std::ostream& out, const Master& master);

}  // namespace zelta_info

#endif
