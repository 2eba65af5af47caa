// A host as a user of the installed library writes it.
#include <cstdio>

#include "dcm/library/version.h"

int main()
{
    std::printf("%s\n", dcm::LibraryVersion());
}
