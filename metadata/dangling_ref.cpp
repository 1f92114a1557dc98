#include "metadata.h"

dangling_ref_base::~dangling_ref_base() = default;
