#include "tools/findings.h"

#include "tools/shown_text.h"

#include <string>
#include <string_view>

namespace dcm::tools {

namespace {

Colour ColourOf(Severity severity)
{
    switch (severity) {
    case Severity::kError:
        return Colour::kRed;
    case Severity::kWarning:
        return Colour::kYellow;
    case Severity::kNote:
        break;
    }
    return Colour::kCyan;
}

} // namespace

std::string FindingText(std::string_view file, const Finding& finding,
                        std::string (*paint)(std::string_view, Colour))
{
    std::string place = Shown(file) + ':';
    if (finding.line > 0)
        place += std::to_string(finding.line) + ':';
    std::string message = Shown(finding.message.View());
    if (!finding.block.IsEmpty())
        message = Shown(finding.block.View()) + ": " + message;
    return paint(place, Colour::kBold) + ' ' +
           paint(ToUtf8(NameOf(finding.severity)), ColourOf(finding.severity)) + ": " + message +
           " [" + std::string(finding.id) + "]";
}

} // namespace dcm::tools
