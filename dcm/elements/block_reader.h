#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"

#include <cstddef>
#include <string_view>

/// Reading the lines of one block.
namespace dcm {

/// One line of a block: its keyword, and all that follows the first blank after it.
struct BlockLine
{
    std::string_view keyword;
    std::string_view rest;

    bool Is(std::wstring_view other) const { return EqualsNoCase(keyword, other); }
};

/// Takes the first word off `rest`: the text before the first blank. `rest` keeps what follows,
/// without white space at its ends. Without a blank the word is empty and `rest` keeps all of it.
/// Callers must strip leading white space first.
std::string_view TakeWord(std::string_view& rest);

/// Walks over the lines of a block that have a keyword and a blank. White space before a keyword is
/// skipped.
class BlockReader
{
public:
    /// The block must outlive the reader.
    explicit BlockReader(const FileBlock& block) : m_block(block) {}

    /// Takes the next such line; false at the end of the block.
    bool Next(BlockLine& line);

    /// The block's text, which turns parts of a line into wide texts.
    const FileText& Text() const { return m_block.Text(); }

private:
    const FileBlock& m_block;
    std::size_t m_next = 0;
};

} // namespace dcm
