#include "fixfiles/TextDecoding.h"
