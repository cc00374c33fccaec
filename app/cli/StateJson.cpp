#include "app/cli/StateJson.h"
