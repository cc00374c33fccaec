#include "fixfiles/ReadStock.h"
