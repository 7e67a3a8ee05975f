#include <cmpi/cmpidt.h>
