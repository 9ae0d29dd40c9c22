#include "one/One.h"
