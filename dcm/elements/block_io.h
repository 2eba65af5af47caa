#pragma once

#include "dcm/platform/automation.h"

#include <string_view>

class DCMBaseType;
class DCMFestwert;
class DCMFestwerteblock;
class DCMKennfeld;
class DCMKennlinie;
class DCMStuetzstellenverteilung;
class PravFile;

namespace dcm {

class BlockReader;
struct CurveFields;
struct DistributionFields;
struct ListFields;
struct MapFields;
struct ValueFields;
class FileBlock;
class FileText;
class FileTextBuilder;

/// How blocks are read from the bytes of a file and composed as such bytes. It is the one friend of
/// the file and of the classes of blocks, whose headers show nothing of this.
struct BlockIo
{
    /// Loads the text of the open file. Throws `CFileException` when reading fails.
    static void Load(PravFile& file);
    /// Takes the lines of the file up to the next empty one; none where two empty lines meet.
    /// Returns false when no empty line follows. The block is valid until the file is opened anew.
    static bool Next(PravFile& file, FileBlock& block);
    /// After the last block: adds what has no line feed to `block`, which has the lines before
    /// that. Returns whether there was nothing to add.
    static bool AddRest(PravFile& file, FileBlock& block);
    /// The text of a file that was loaded.
    static const FileText& TextOf(const PravFile& file);

    /// `Init` for the lines of a block. A failure leaves what was read before it.
    static HRESULT Read(const FileBlock& lines, DCMFestwert& block);
    static HRESULT Read(const FileBlock& lines, DCMFestwerteblock& block);
    static HRESULT Read(const FileBlock& lines, DCMStuetzstellenverteilung& block);
    static HRESULT Read(const FileBlock& lines, DCMKennlinie& block);
    static HRESULT Read(const FileBlock& lines, DCMKennfeld& block);

    /// Appends the text of the block, which stays as it is.
    static void Compose(const DCMFestwert& block, FileTextBuilder& text);
    static void Compose(const DCMFestwerteblock& block, FileTextBuilder& text);
    static void Compose(const DCMStuetzstellenverteilung& block, FileTextBuilder& text);
    static void Compose(const DCMKennlinie& block, FileTextBuilder& text);
    /// Appends nothing when the map has too few values for its axes, or no line at all.
    static void Compose(const DCMKennfeld& block, FileTextBuilder& text);

    /// Stores `value` when `keyword` is LANGNAME or DISPLAYNAME, `function` when it is FUNKTION;
    /// otherwise returns false. Both are parts of the text of `reader`.
    static bool ReadAttribute(std::string_view keyword, std::string_view value,
                              std::string_view function, const BlockReader& reader,
                              DCMBaseType& block);

    /// Appends the lines of LANGNAME, DISPLAYNAME and FUNKTION.
    static void ComposeAttributes(const DCMBaseType& block, FileTextBuilder& text);

    /// The fields that are moved out of a block or into it.
    static ValueFields FieldsOf(DCMFestwert& block);
    static ListFields FieldsOf(DCMFestwerteblock& block);
    static DistributionFields FieldsOf(DCMStuetzstellenverteilung& block);
    static CurveFields FieldsOf(DCMKennlinie& block);
    static MapFields FieldsOf(DCMKennfeld& block);
};

} // namespace dcm
