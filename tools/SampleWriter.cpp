#include "tools/SampleWriter.h"
