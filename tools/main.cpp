#include "tools/command_line.h"
#include "tools/output.h"
#include "tools/shown_text.h"
#include "tools/system/system.h"
#include "tools/trouble.h"

#include <exception>
#include <new>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

int Run(std::vector<std::string> arguments)
{
    PrepareStreams();
    try {
        CommandLine commandLine;
        const int result = commandLine.Run(std::move(arguments));
        FinishOutput();
        return result;
    } catch (const CLI::ParseError& error) {
        Complain(Shown(std::string_view(error.what())) + "; see dcm --help");
    } catch (const Trouble& trouble) {
        Complain(trouble.what());
    } catch (const std::bad_alloc&) {
        Complain("memory ran out");
    } catch (const std::exception& error) {
        Complain(error.what());
    }
    return kTrouble;
}

} // namespace dcm::tools
