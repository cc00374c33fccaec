#include "fixfiles/DocumentView.h"
