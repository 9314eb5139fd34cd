#include "TarvikAbi.h"

// The name by which applications are held to the same standard library.

const char TARVIK_ABI = 0;
