#pragma once

#include "dcm/platform/codepage.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/fileblock.h"

#include <string_view>

/// Reading the text of one block, as the bytes that it has in its file.
namespace dcm {

inline FileTextView TrimWhite(FileTextView text)
{
    return {TrimWhite(text.bytes), text.file};
}

inline FileTextView TrimBlanks(FileTextView text)
{
    return {TrimBlanks(text.bytes), text.file};
}

inline FileTextView TrimQuotes(FileTextView text)
{
    return {TrimQuotes(text.bytes), text.file};
}

inline FileTextView TrimBlanksAndQuotes(FileTextView text)
{
    return {TrimBlanksAndQuotes(text.bytes), text.file};
}

/// One line of a block: its keyword, and all that follows the first blank behind it.
struct BlockLine
{
    std::string_view keyword;
    FileTextView rest;

    bool Is(std::wstring_view other) const { return EqualsNoCase(keyword, other); }
};

/// Walks over the lines of a block that have a keyword and a blank. White space in front of a line
/// does not count.
class BlockLines
{
public:
    /// The block, whose lines are of a file's text, must outlive this object.
    explicit BlockLines(const FileBlock& block) : m_block(block) {}

    /// Takes the next such line. False at the end.
    bool Next(BlockLine& line);

private:
    const FileBlock& m_block;
    std::size_t m_next = 0;
};

/// Takes the name, the text before the first blank, off `rest`, which keeps what follows without
/// white space at its ends. Without a blank there is no name and `rest` keeps all of it. White
/// space in front is the caller's matter.
FileTextView TakeName(FileTextView& rest);

} // namespace dcm
