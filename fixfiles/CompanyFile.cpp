#include "fixfiles/CompanyFile.h"
