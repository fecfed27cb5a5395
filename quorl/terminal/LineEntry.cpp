#include "quorl/terminal/LineEntry.h"

#include "quorl/terminal/sheets/TerminalText.h"
#include "services/base/Utf8.h"

namespace quorl {

namespace {

constexpr char endOfInput = 0x04;
constexpr char backspace = 0x08;
constexpr char clearLine = 0x15;
constexpr char escape = 0x1B;
constexpr char deleteBefore = 0x7F;

bool isControl(char byte) { return static_cast<unsigned char>(byte) < ' ' || byte == deleteBefore; }

/// By the rule that all sequences follow, also those of keys that nothing is known of.
bool isComplete(std::string_view sequence) {
    const char last = sequence.back();
    const bool isFinal = last >= '@' && last <= '~';
    return sequence.size() > 2 && isFinal;
}

} // namespace

void LineEntry::take(std::string_view bytes) {
    for (const char byte : bytes) {
        take(byte);
    }
}

void LineEntry::take(char byte) {
    if (!sequence_.empty()) {
        takeOfSequence(byte);
    } else if (byte == escape) {
        sequence_ = byte;
    } else if (isControl(byte)) {
        takeControl(byte);
    } else {
        typed_ += byte;
    }
}

void LineEntry::takeOfSequence(char byte) {
    if (sequence_.size() == 1 && byte != '[' && byte != 'O') {
        sequence_.clear(); // the key Escape, and then another one
        take(byte);
        return;
    }
    sequence_ += byte;
    if (isComplete(sequence_)) {
        if (const auto key = keys_.find(sequence_); key != keys_.end()) {
            lines_.push_back(key->second);
        }
        sequence_.clear();
    }
}

void LineEntry::takeControl(char byte) {
    if (byte == '\n' || byte == '\r') {
        lines_.emplace_back(base::trimmed(typed_));
        typed_.clear();
    } else if (byte == backspace || byte == deleteBefore) {
        typed_ = withoutLastCharacter(typed_);
    } else if (byte == clearLine) {
        typed_.clear();
    } else if (byte == endOfInput && typed_.empty()) {
        isAtEnd_ = true;
    } else if (const auto key = keys_.find(std::string(1, byte)); key != keys_.end()) {
        lines_.push_back(key->second);
    }
}

void LineEntry::end() {
    if (!typed_.empty()) {
        takeControl('\n');
    }
    isAtEnd_ = true;
}

void LineEntry::close() {
    lines_.clear();
    typed_.clear();
    isAtEnd_ = true;
}

std::optional<std::string> LineEntry::takeLine() {
    if (lines_.empty()) {
        return std::nullopt;
    }
    auto line = std::move(lines_.front());
    lines_.pop_front();
    return line;
}

} // namespace quorl
