#include "mxf.h"

MXFMetadataHandler::~MXFMetadataHandler() = default;
