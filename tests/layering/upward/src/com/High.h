#pragma once
#include "kern/Low.h"
