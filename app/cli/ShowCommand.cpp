#include "app/cli/ShowCommand.h"
