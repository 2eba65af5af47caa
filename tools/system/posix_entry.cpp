#include "tools/system/system.h"

int main(int argc, char** argv)
{
    return dcm::tools::Run({argv + (argc > 0 ? 1 : 0), argv + argc});
}
