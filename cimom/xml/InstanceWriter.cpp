#include <cimom/xml/Writer.h>
