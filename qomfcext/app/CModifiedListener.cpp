#include "CModifiedListener.h"

// Out of line so that the class's virtual table lives in the library.
CModifiedListener::~CModifiedListener() {}
