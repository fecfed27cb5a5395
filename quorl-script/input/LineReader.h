#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace quorl {

/// Reads lines from a file descriptor as they come. The end of the last line may be missing.
class LineReader {
  public:
    enum class Result { Line, TooLong, End };

    /// Longer lines than this are skipped.
    static constexpr std::size_t limit = 64UL << 20U;

    /// `descriptor` is not the reader's to close.
    explicit LineReader(int descriptor) : descriptor_(descriptor), buffer_(1UL << 16U) {}

    /// Waits for the next line and puts it into `line`, without its end. Throws `std::system_error`
    /// where the descriptor cannot be read.
    [[nodiscard]] Result next(std::string& line);

  private:
    /// False at the end of the input.
    [[nodiscard]] bool fill();

    int descriptor_;
    std::vector<char> buffer_;
    std::size_t begin_ = 0; ///< what of the buffer is not taken yet
    std::size_t end_ = 0;
};

} // namespace quorl
