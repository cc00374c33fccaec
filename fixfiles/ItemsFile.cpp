#include "fixfiles/ItemsFile.h"
