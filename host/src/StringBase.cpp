#include "Port/StringBase.h"
