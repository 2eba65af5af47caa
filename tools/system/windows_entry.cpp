#include "dcm/library/dcm.h"
#include "tools/system/system.h"

#include <string>
#include <utility>
#include <vector>

int wmain(int argc, wchar_t** argv)
{
    std::vector<std::string> arguments;
    for (int i = 1; i < argc; ++i)
        arguments.push_back(dcm::ToUtf8(argv[i]));
    return dcm::tools::Run(std::move(arguments));
}
