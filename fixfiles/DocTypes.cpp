#include "fixfiles/DocTypes.h"
