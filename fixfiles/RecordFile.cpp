#include "fixfiles/RecordFile.h"
