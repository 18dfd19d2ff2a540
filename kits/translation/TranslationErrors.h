// Errors of translators.
#pragma once

#include <Errors.h>

// B_NO_TRANSLATOR: nobody knows the data, or nobody can make what is wanted of it. B_ILLEGAL_DATA: the format
// is known, but the data is damaged or too large.
