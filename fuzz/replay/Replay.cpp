// Gives a target its seeds, and mutations of them that are the same in each run.

#include <algorithm>
#include <bit>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "services/base/FileDescriptor.h"
#include "tests/support/Damage.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

constexpr std::uint32_t parts = 4;

std::vector<std::string> readSeeds() {
    std::ifstream list(SEEDS);
    std::vector<std::string> seeds;
    for (std::string file; std::getline(list, file, ',');) {
        std::ifstream stream(file, std::ios::binary);
        EXPECT_TRUE(stream.is_open()) << file;
        seeds.emplace_back(std::istreambuf_iterator<char>(stream),
                           std::istreambuf_iterator<char>());
    }
    return seeds;
}

/// Where a process that is ended by an input leaves that.
std::filesystem::path lastInput() {
    const auto* const test = testing::UnitTest::GetInstance()->current_test_info();
    std::string name = std::string(test->name()) + "-" +
                       std::filesystem::read_symlink("/proc/self/exe").filename().string();
    std::ranges::replace(name, '/', '-');
    return std::filesystem::temp_directory_path() / name;
}

class Inputs : public testing::TestWithParam<std::uint32_t> {
  protected:
    ~Inputs() override { std::filesystem::remove(file_); }

    void run(const std::string& input) {
        ASSERT_EQ(ftruncate(opened_.get(), 0), 0);
        ASSERT_EQ(pwrite(opened_.get(), input.data(), input.size(), 0),
                  static_cast<ssize_t>(input.size()));
        LLVMFuzzerTestOneInput(std::bit_cast<const std::uint8_t*>(input.data()), input.size());
    }

    const std::vector<std::string> seeds_ = readSeeds();

  private:
    const std::filesystem::path file_ = lastInput();
    const quorl::base::FileDescriptor opened_{
        open(file_.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600)};
};

TEST_F(Inputs, OfTheSeedsDoNoHarm) {
    ASSERT_FALSE(seeds_.empty());
    for (const std::string& seed : seeds_) {
        run(seed);
    }
    run({});
}

TEST_P(Inputs, ThatAreMutatedDoNoHarm) {
    ASSERT_FALSE(seeds_.empty());
    quorl::tests::Damage damage(GetParam());
    for (int count = 0; count < MUTATIONS / static_cast<int>(parts); ++count) {
        run(damage.of(seeds_[damage.below(seeds_.size())]));
    }
}

INSTANTIATE_TEST_SUITE_P(Part, Inputs, testing::Range(0U, parts));

} // namespace
