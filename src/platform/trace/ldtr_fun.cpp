#include "ldtr.h"

__attribute__((weak)) ldtr_function_global ldtr_fun;
