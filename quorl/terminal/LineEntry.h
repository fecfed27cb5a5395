#pragma once

#include <deque>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace quorl {

/// Makes lines of what is typed, byte by byte, as a terminal does by itself where it is let.
class LineEntry {
  public:
    /// Sequences of bytes that keys send, each with the line that it stands for.
    using Keys = std::map<std::string, std::string>;

    explicit LineEntry(Keys keys) : keys_(std::move(keys)) {}

    void take(std::string_view bytes);

    /// No more is typed: what is there is a line.
    void end();

    /// Nothing more is taken, not even what has been typed already.
    void close();

    /// The oldest line that has not been taken yet, without its end; null for none.
    [[nodiscard]] std::optional<std::string> takeLine();

    /// What has been typed of a line that is not complete.
    [[nodiscard]] const std::string& typed() const { return typed_; }

    [[nodiscard]] bool isAtEnd() const { return isAtEnd_; }

  private:
    void take(char byte);
    void takeControl(char byte);
    void takeOfSequence(char byte);

    const Keys keys_;
    std::deque<std::string> lines_;
    std::string typed_;
    std::string sequence_; ///< what there is of one that a key sends
    bool isAtEnd_ = false;
};

} // namespace quorl
