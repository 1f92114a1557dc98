#include "mxf.h"

MXFGCStructureHandler::~MXFGCStructureHandler() = default;

MXFGCSystemHandler::~MXFGCSystemHandler() = default;

MXFGCEssenceHandler::~MXFGCEssenceHandler() = default;
