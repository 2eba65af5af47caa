// Runs a target over files and folders of files, without libFuzzer.

#include "fuzz/target.h"

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

namespace {

int replayed = 0;

void Replay(const std::filesystem::path& path)
{
    if (std::filesystem::is_directory(path)) {
        for (const auto& entry : std::filesystem::directory_iterator(path))
            Replay(entry.path());
        return;
    }
    std::ifstream file(path, std::ios::binary);
    const std::string bytes(std::istreambuf_iterator<char>(file), {});
    std::printf("%s\n", path.c_str());
    std::fflush(stdout);
    LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size());
    ++replayed;
}

} // namespace

int main(int argc, char** argv)
{
    for (int i = 1; i < argc; ++i)
        Replay(argv[i]);
    return replayed > 0 ? 0 : 1;
}
