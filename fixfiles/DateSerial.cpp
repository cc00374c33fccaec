#include "fixfiles/DateSerial.h"
