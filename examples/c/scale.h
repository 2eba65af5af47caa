#ifndef SCALE_H
#define SCALE_H

#include <stddef.h>

/* What the example needs of the system that it runs on. */
typedef struct
{
    /* Shows a text. */
    void (*say)(const char* text, size_t length);
    /* Memory for that many numbers until the end of the example; null when there is none. */
    double* (*room)(size_t count);
} surroundings;

/* Shows what is in the file `in`, multiplies all values of the parameter `name` by `factor` and
   writes the file `out`. Returns 0, or 1 when that fails, and says why. */
int scale(const surroundings* system, const char* in, const char* out, const char* name,
          double factor);

#endif
