#include "platform/Grid.h"
