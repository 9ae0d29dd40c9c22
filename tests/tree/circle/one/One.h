#include "other/Other.h"
