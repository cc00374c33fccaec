#include "fixfiles/Formats.h"
