// A block of each kind reads any text, twice, and is copied and written. The first byte chooses the
// kind (the letters from B on: the kinds in their order, then the version of the format). The other
// bytes are the text in UTF-8, including zeros.

#include "fuzz/target.h"

namespace {

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
        const std::string written = test::Written(block, MemoryFile());
        Require(written != "failed", "the result of Export");
        for (Block* same : {&copy, &assigned, &block})
            Require(test::Written(*same, MemoryFile()) == written, "copies are written alike");
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    if (size == 0)
        return 0;
    int kind = *data % 11;
    const CString text = dcm::FromUtf8({reinterpret_cast<const char*>(data + 1), size - 1});
    test::ForEachKind([&](const char*, auto get, auto) {
        if (kind-- == 0)
            Check<test::BlockOf<decltype(get)>>(text);
    });
    if (kind == 0)
        Check<DCMKonservierungsFormat>(text);
    return 0;
}
