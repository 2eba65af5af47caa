/* host IN.dcm OUT.dcm NAME FACTOR
   Shows the parameters of a file, in UTF-8, multiplies the values of one of them by a factor and
   writes the file again. Paths and name are UTF-8. */
#include "scale.h"

#include <stdio.h>
#include <stdlib.h>

static double* numbers;

static void print(const char* text, size_t length)
{
    fwrite(text, 1, length, stdout);
}

static double* room(size_t count)
{
    free(numbers);
    numbers = malloc((count + 1) * sizeof *numbers);
    return numbers;
}

int main(int argc, char** argv)
{
    const surroundings system = {print, room};
    int result;
    if (argc != 5) {
        fputs("usage: host IN.dcm OUT.dcm NAME FACTOR\n", stderr);
        return 2;
    }
    result = scale(&system, argv[1], argv[2], argv[3], strtod(argv[4], NULL));
    free(numbers);
    return result;
}
