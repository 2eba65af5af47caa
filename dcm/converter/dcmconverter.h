#pragma once

#include "dcm/converter/dcmheader.h"
#include "dcm/elements/festwert.h"
#include "dcm/elements/festwerteblock.h"
#include "dcm/elements/kennfeld.h"
#include "dcm/elements/kennlinie.h"
#include "dcm/elements/konservierungsformat.h"
#include "dcm/elements/stuetzstellenverteilung.h"
#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

#include <cstdint>
#include <list>

class PravFile;

namespace dcm {
struct DocumentIo;
class FileBlock;
} // namespace dcm

/// The document: the blocks of a DCM file, one list for each kind, with the text at the top of an
/// exported file and the comment of an imported one.
///
/// The document owns its blocks. What goes in is copied, what comes out is a copy. A document is
/// used by one caller at a time; two documents have nothing in common.
class DCM_API DCMConverter
{
public:
    /// No blocks, empty header and comment.
    DCMConverter();
    /// All of the other document; one that was moved from has no defined content.
    DCMConverter(const DCMConverter&) = default;
    DCMConverter(DCMConverter&&) noexcept = default;
    /// As construction does. The document is as it was when memory runs out.
    DCMConverter& operator=(const DCMConverter& other);
    DCMConverter& operator=(DCMConverter&&) noexcept = default;
    virtual ~DCMConverter();

    /// Reads a DCM file and adds its blocks, in the order of the file, to those already held.
    /// Blocks of unknown kinds, and a last block that no empty line follows, are skipped. Returns
    /// 0, or `E_UNEXPECTED` when the file cannot be opened or read, memory runs out, or a
    /// FESTWERTEBLOCK has a line with nothing but blanks and double quotes, or tabs around them,
    /// after `WERT` and a blank. The blocks read before that stay. Throws nothing.
    HRESULT Import(const CString& strPath);

    /// Writes the header text, the format version 2.0 and all blocks, kind after kind. An existing
    /// file is replaced. Returns 0, or `E_UNEXPECTED` when the file cannot be created or written
    /// or memory runs out; what was written until then stays in the file. Throws nothing.
    HRESULT Export(const CString& strPath) const;

    /// Stores the version in the document; the file always declares 2.0.
    void SetVersion(double dVersion) { m_format.SetValue(dVersion); }
    /// Sets the text at the top of the exported file. Comment lines must begin with "* ".
    void SetHeader(const CString& strHeader) { m_header.SetText(strHeader); }
    /// The comment at the top of the file imported last that had one: its lines, each ended by a
    /// line feed, without any "* ". It is not exported.
    CString GetComment() const { return m_strComment; }

    /// Appends a copy of the block to the list of its kind; blocks of equal names are all kept.
    /// Returns 0.
    HRESULT AddFestwert(const DCMFestwert& block);
    HRESULT AddFestwerteblock(const DCMFestwerteblock& block);
    HRESULT AddStuetzstellenverteilung(DCMStuetzstellenverteilung block);
    HRESULT AddKennlinie(const DCMKennlinie& block);
    HRESULT AddFestkennlinie(const DCMFestkennlinie& block);
    HRESULT AddGruppenkennlinie(const DCMGruppenkennlinie& block);
    HRESULT AddKennfeld(const DCMKennfeld& block);
    HRESULT AddFestkennfeld(const DCMFestkennfeld& block);
    HRESULT AddGruppenkennfeld(const DCMGruppenkennfeld& block);
    HRESULT AddTextstring(const DCMTextstring& block);

    /// A copy of all blocks of the kind, in the order in which they were added.
    std::list<DCMFestwert> GetFestwerte() const { return m_listFestwerte; }
    std::list<DCMFestwerteblock> GetFestwerteblock() const { return m_listFestwerteblock; }
    std::list<DCMStuetzstellenverteilung> GetStuetzstellenverteilung() const
    {
        return m_listStuetzstellenverteilung;
    }
    std::list<DCMKennlinie> GetKennlinie() const { return m_listKennlinie; }
    std::list<DCMFestkennlinie> GetFestkennlinie() const { return m_listFestkennlinie; }
    std::list<DCMGruppenkennlinie> GetGruppenkennlinie() const { return m_listGruppenkennlinie; }
    std::list<DCMKennfeld> GetKennfeld() const { return m_listKennfeld; }
    std::list<DCMFestkennfeld> GetFestkennfeld() const { return m_listFestkennfeld; }
    std::list<DCMGruppenkennfeld> GetGruppenkennfeld() const { return m_listGruppenkennfeld; }
    std::list<DCMTextstring> GetTextstring() const { return m_listTextstring; }

private:
    friend struct dcm::DocumentIo;

    HRESULT AnalyzeToken(const dcm::FileBlock& block);
    HRESULT InsertKommentar(const dcm::FileBlock& block);
    HRESULT InsertKonservierungsFormat(const dcm::FileBlock& block);
    HRESULT InsertFestwert(const dcm::FileBlock& block);
    HRESULT InsertFestwerteBlock(const dcm::FileBlock& block);
    HRESULT InsertStuetzstellenverteilung(const dcm::FileBlock& block);
    HRESULT InsertKennlinie(const dcm::FileBlock& block);
    HRESULT InsertFestKennlinie(const dcm::FileBlock& block);
    HRESULT InsertGruppenKennlinie(const dcm::FileBlock& block);
    HRESULT InsertKennfeld(const dcm::FileBlock& block);
    HRESULT InsertFestKennfeld(const dcm::FileBlock& block);
    HRESULT InsertGruppenKennfeld(const dcm::FileBlock& block);
    HRESULT InsertTextstring(const dcm::FileBlock& block);

    HRESULT WriteHeader(PravFile& file) const;
    HRESULT WriteFormat(PravFile& file) const;
    HRESULT WriteFestwerte(PravFile& file) const;
    HRESULT WriteFestwerteblock(PravFile& file) const;
    HRESULT WriteStuetzstellenverteilung(PravFile& file) const;
    HRESULT WriteKennlinie(PravFile& file) const;
    HRESULT WriteFestKennlinie(PravFile& file) const;
    HRESULT WriteGruppenKennlinie(PravFile& file) const;
    HRESULT WriteKennfeld(PravFile& file) const;
    HRESULT WriteFestKennfeld(PravFile& file) const;
    HRESULT WriteGruppenKennfeld(PravFile& file) const;
    HRESULT WriteTextstring(PravFile& file) const;

    DCMHeader m_header;
    DCMKonservierungsFormat m_format;
    std::list<DCMFestwert> m_listFestwerte;
    std::list<DCMFestwerteblock> m_listFestwerteblock;
    std::list<DCMStuetzstellenverteilung> m_listStuetzstellenverteilung;
    std::list<DCMKennlinie> m_listKennlinie;
    std::list<DCMFestkennlinie> m_listFestkennlinie;
    std::list<DCMGruppenkennlinie> m_listGruppenkennlinie;
    std::list<DCMKennfeld> m_listKennfeld;
    std::list<DCMFestkennfeld> m_listFestkennfeld;
    std::list<DCMGruppenkennfeld> m_listGruppenkennfeld;
    std::list<DCMTextstring> m_listTextstring;
    /// Whether this import has read a block of a known kind, which ends the comment.
    std::int32_t m_bBlockSeen = 0;
    CString m_strComment;
};
