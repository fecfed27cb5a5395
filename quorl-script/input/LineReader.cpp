#include "quorl-script/input/LineReader.h"

#include <algorithm>
#include <cerrno>
#include <system_error>

#include <unistd.h>

namespace quorl {

LineReader::Result LineReader::next(std::string& line) {
    line.clear();
    bool isTooLong = false;
    bool hasBegun = false;
    while (begin_ < end_ || fill()) {
        hasBegun = true;
        const auto first = buffer_.begin() + static_cast<std::ptrdiff_t>(begin_);
        const auto last = buffer_.begin() + static_cast<std::ptrdiff_t>(end_);
        const auto newline = std::find(first, last, '\n');
        const auto length = static_cast<std::size_t>(newline - first);
        isTooLong = isTooLong || line.size() + length > limit;
        if (!isTooLong) {
            line.append(first, newline);
        }
        begin_ += length;
        if (newline != last) {
            ++begin_;
            return isTooLong ? Result::TooLong : Result::Line;
        }
    }
    if (!hasBegun) {
        return Result::End;
    }
    return isTooLong ? Result::TooLong : Result::Line;
}

bool LineReader::fill() {
    ssize_t length = 0;
    do {
        length = read(descriptor_, buffer_.data(), buffer_.size());
    } while (length < 0 && errno == EINTR);
    if (length < 0) {
        throw std::system_error(errno, std::generic_category());
    }
    begin_ = 0;
    end_ = static_cast<std::size_t>(length);
    return length > 0;
}

} // namespace quorl
