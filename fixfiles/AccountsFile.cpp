#include "fixfiles/AccountsFile.h"
