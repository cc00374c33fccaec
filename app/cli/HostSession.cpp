#include "app/cli/HostSession.h"
