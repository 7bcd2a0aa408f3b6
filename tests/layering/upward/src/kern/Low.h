#pragma once
#include "com/High.h"
