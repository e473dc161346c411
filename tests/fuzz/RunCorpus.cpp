// Feeds a fuzz target every file of the folders on the command line, whole and cut short, so that
// targets run as ordinary tests without libFuzzer. Fails if there is no input at all.

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

using Bytes = std::vector<std::uint8_t>;

// Every length of a short input, and about this many lengths of a long one.
constexpr std::size_t cutsPerInput = 512;

Bytes read(const std::filesystem::path& file) {
    std::ifstream in(file, std::ios::binary);
    return Bytes(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

void feed(const Bytes& input) {
    const std::size_t step = input.size() / cutsPerInput + 1;
    for (std::size_t size = 0; size < input.size(); size += step) {
        // A copy of the exact size, so that a sanitizer sees a read behind its end.
        const Bytes cut(input.begin(), input.begin() + static_cast<std::ptrdiff_t>(size));
        LLVMFuzzerTestOneInput(cut.data(), cut.size());
    }
    LLVMFuzzerTestOneInput(input.data(), input.size());
}

}  // namespace

int main(int argc, char** argv) {
    int inputs = 0;
    for (int i = 1; i < argc; ++i) {
        for (const auto& entry : std::filesystem::directory_iterator(argv[i])) {
            if (entry.is_regular_file()) {
                feed(read(entry.path()));
                ++inputs;
            }
        }
    }
    std::printf("%d inputs\n", inputs);
    return inputs > 0 ? 0 : 1;
}
