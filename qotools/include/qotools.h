// Everything of the base library's core in one include: strings, exceptions,
// the interactive hooks, files with character sets and configuration files.
#pragma once

#include "QoToolsApi.h"
#include "CQoString.h"
#include "CQoException.h"
#include "CQoInterActive.h"
#include "CQoFile.h"
#include "CQoConfigFile.h"
