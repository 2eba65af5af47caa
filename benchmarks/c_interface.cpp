// c_interface [ROUNDS]
// Reads all names, axes and values of a file of a million numbers through the C interface, and
// measures that against opening the file. Prints the least time of each and the ratio; fails when
// it is above the limit.

#include "benchmarks/data.h"
#include "benchmarks/temporary_folder.h"
#include "bindings/c/dcm_c.h"
#include "dcm/library/dcm.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <limits>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using namespace dcm::bench;

constexpr double kLimit = 0.3;

/// The processor's time, which other programs on the machine disturb least.
template <class Work>
double SecondsOf(const Work& work)
{
    const std::clock_t start = std::clock();
    work();
    return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

void Check(dcm_result result)
{
    if (result != DCM_OK)
        throw std::runtime_error(dcm_last_error());
}

/// All that is read: the numbers, and the characters of names.
struct Content
{
    std::uint64_t checksum = 0;
    std::size_t characters = 0;
};

Content ReadAll(const dcm_document* document)
{
    Checksum checksum;
    Content content;
    char name[1024];
    std::vector<double> numbers;
    std::size_t count = 0;
    Check(dcm_document_parameter_count(document, &count));
    for (std::size_t i = 0; i < count; ++i) {
        dcm_parameter* parameter = nullptr;
        std::size_t length = 0;
        Check(dcm_document_parameter(document, i, &parameter));
        Check(dcm_parameter_get_text(parameter, DCM_NAME, name, sizeof name, &length));
        content.characters += length;
        std::int32_t kind = 0;
        Check(dcm_parameter_kind(parameter, &kind));
        if (kind == DCM_TEXTSTRING)
            continue;
        for (const int array : {DCM_POINTS_X, DCM_POINTS_Y, DCM_VALUES}) {
            std::size_t size = 0;
            Check(dcm_parameter_count(parameter, array, &size));
            numbers.resize(size);
            Check(dcm_parameter_get_numbers(parameter, array, numbers.data(), size, &size));
            checksum.Add(numbers);
        }
    }
    content.checksum = checksum.Value();
    return content;
}

/// The same, of the data that the file is made of.
std::size_t CharactersOf(const Data& data)
{
    std::size_t characters = 0;
    for (const Block& block : data.blocks)
        characters += block.name.size();
    return characters;
}

} // namespace

int main(int argc, char** argv)
{
    const int rounds = argc > 1 ? std::atoi(argv[1]) : 5;
    const TemporaryFolder folder;
    const std::string path = (folder.Path() / "data.dcm").string();
    const Data data = MakeData(Flavour::kShort, 1.0);
    std::ofstream(path, std::ios::binary) << DcmText(data);

    constexpr double most = std::numeric_limits<double>::max();
    double import = most, open = most, read = most;
    for (int round = 0; round < rounds; ++round) {
        import = std::min(import, SecondsOf([&] {
                              DCMConverter document;
        if (FAILED(document.Import(dcm::FromUtf8(path))))
            throw std::runtime_error("cannot import the file");
    }));
    dcm_document* document = nullptr;
    Check(dcm_document_new(&document));
    open = std::min(open, SecondsOf([&] { Check(dcm_document_open(document, path.c_str())); }));
    Content content;
    read = std::min(read, SecondsOf([&] { content = ReadAll(document); }));
    if (content.checksum != data.checksum || content.characters != CharactersOf(data))
        throw std::runtime_error("other names or numbers than in the file");
    Check(dcm_document_free(document));
}
std::fprintf(stderr,
             "%zu numbers: import %.4f s, dcm_document_open %.4f s, names and numbers %.4f s, "
             "ratio to the import %.3f (limit %.1f)\n",
             data.numbers, import, open, read, read / import, kLimit);
return read <= kLimit * import ? EXIT_SUCCESS : EXIT_FAILURE;
}
