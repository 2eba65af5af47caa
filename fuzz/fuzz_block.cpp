// Each kind of block reads any text, twice over, and is copied and written. The first byte chooses
// the kind (the letters from B on are the kinds in the order below), the others are the text in
// UTF-8, zeros included.

#include "dcm/library/dcm.h"
#include "dcm/platform/codepage.h"
#include "dcm/platform/exception.h"
#include "fuzz/memory_file.h"
#include "fuzz/target.h"

#include <string>
#include <string_view>

namespace {

template <class Block>
std::string Written(Block& block)
{
    static MemoryFile file;
    PravFile target(file.Path(), CFile::modeCreate | CFile::modeWrite);
    Require(block.Export(target) == S_OK, "the result of Export");
    target.Close();
    return file.Bytes();
}

template <class Block>
void Check(const CString& text)
{
    Block block;
    for (int pass = 0; pass < 2; ++pass) {
        try {
            const HRESULT result = block.Init(text);
            Require(result == S_OK || result == E_FAIL, "the result of Init");
        } catch (const dcm::ResultError& error) {
            Require(error.Code() == E_INVALIDARG, "what Init raises");
        }
        Block copy(block), assigned;
        assigned.Init(CString(L"KENNFELD a 1 1\n ST/X 1\n ST/Y \"a\"\n WERT 1\n TEXT \"b\"\n"));
        assigned = block;
        const std::string written = Written(block);
        for (Block* same : {&copy, &assigned, &block})
            Require(Written(*same) == written, "a copy and the block are written alike");
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    constexpr void (*checks[])(const CString&) = {Check<DCMFestwert>,
                                                  Check<DCMTextstring>,
                                                  Check<DCMFestwerteblock>,
                                                  Check<DCMStuetzstellenverteilung>,
                                                  Check<DCMKennlinie>,
                                                  Check<DCMFestkennlinie>,
                                                  Check<DCMGruppenkennlinie>,
                                                  Check<DCMKennfeld>,
                                                  Check<DCMFestkennfeld>,
                                                  Check<DCMGruppenkennfeld>,
                                                  Check<DCMKonservierungsFormat>};
    if (size == 0)
        return 0;
    const std::size_t kind = *data % std::size(checks);
    CString text;
    dcm::AppendWide(text,
                    {{reinterpret_cast<const char*>(data + 1), size - 1}, dcm::Encoding::kUtf8});
    checks[kind](text);
    return 0;
}
