#include "services/wearable/ManifestReader.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <istream>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <nlohmann/json.hpp>

#include "services/language/Translated.h"

namespace quorl::wearable {

using language::toTranslate;

namespace {

using nlohmann::json;

/// What `encoded` in Manifest.cpp made a text of.
std::string decoded(std::string_view text) {
    std::string bytes;
    while (!text.empty()) {
        if (text.front() != '%') {
            bytes += text.front();
            text.remove_prefix(1);
            continue;
        }
        constexpr int hexadecimal = 16;
        unsigned char value = 0;
        const auto digits = text.substr(1, 2);
        const auto* const end = digits.data() + digits.size();
        const auto read = std::from_chars(digits.data(), end, value, hexadecimal);
        if (digits.size() != 2 || read.ec != std::errc{} || read.ptr != end) {
            throw WrongManifest{toTranslate("a path is not well-formed")};
        }
        bytes += static_cast<char>(value);
        text.remove_prefix(3);
    }
    return bytes;
}

/// The device may have been in other hands, and names are used to remove files.
const std::string& checkedName(const std::string& name) {
    const bool leadsElsewhere = name.empty() || name == "." || name == ".." ||
                                name.find('/') != std::string::npos ||
                                name.find('\0') != std::string::npos;
    if (leadsElsewhere) {
        throw WrongManifest{toTranslate("a name leads out of the music directory")};
    }
    return name;
}

constexpr auto notWellFormed = toTranslate("it is not well-formed");

/// The value of a member, as far as it matters here.
struct Field {
    enum class Kind { Missing, Number, NegativeNumber, Text, Other };

    Kind kind = Kind::Missing;
    std::uint64_t number = 0;
    std::int64_t negativeNumber = 0;
    std::string text = {};
};

using Kind = Field::Kind;

const std::string& textOf(const Field& field) {
    if (field.kind != Kind::Text) {
        throw WrongManifest{notWellFormed};
    }
    return field.text;
}

template <class Number>
Number numberOf(const Field& field) {
    if (field.kind == Kind::Missing) {
        throw WrongManifest{notWellFormed};
    }
    if (field.kind == Kind::Number && std::in_range<Number>(field.number)) {
        return static_cast<Number>(field.number);
    }
    if (field.kind == Kind::NegativeNumber && std::in_range<Number>(field.negativeNumber)) {
        return static_cast<Number>(field.negativeNumber);
    }
    throw WrongManifest{toTranslate("a number in it is not a whole one, or out of range")};
}

/// Of an object, those members that have these names.
class Fields {
  public:
    static constexpr std::size_t most = 5;
    using Names = std::array<std::string_view, most>;

    void begin(const Names& names) {
        names_ = &names;
        at_ = most;
        for (auto& field : fields_) {
            field.kind = Kind::Missing;
        }
    }

    /// The value of this member is the next.
    void choose(std::string_view name) {
        at_ = static_cast<std::size_t>(std::ranges::find(*names_, name) - names_->begin());
    }

    /// Null where it does not matter.
    [[nodiscard]] Field* chosen() { return at_ < most ? &fields_.at(at_) : nullptr; }

    [[nodiscard]] const Field& operator[](std::size_t at) const { return fields_.at(at); }

  private:
    const Names* names_ = nullptr;
    std::array<Field, most> fields_;
    std::size_t at_ = most;
};

constexpr Fields::Names namesOfEntry{"name", "source", "size", "modified", "hash"};
constexpr Fields::Names namesOfSelection{"playlist", "revision", "limitType", "limit"};

/// An empty text stands for one that is not known.
std::optional<Digest> hashIn(const std::string& text) {
    const auto hash = digestIn(text);
    if (!hash && !text.empty()) {
        throw WrongManifest{notWellFormed};
    }
    return hash;
}

Entry entryOf(const Fields& fields) {
    return {checkedName(textOf(fields[0])), decoded(textOf(fields[1])),
            numberOf<std::uint64_t>(fields[2]), numberOf<std::int64_t>(fields[3]),
            hashIn(textOf(fields[4]))};
}

Selection selectionOf(const Fields& fields) {
    return {numberOf<std::uint64_t>(fields[0]), numberOf<std::uint64_t>(fields[1]),
            numberOf<std::uint64_t>(fields[2]), numberOf<std::uint64_t>(fields[3])};
}

/// Takes the manifest out of its text while that is read, so that a long one is never held twice.
/// What is wrong with a member only counts when the whole text turns out to be JSON, and nothing is
/// wrong with those that count before it.
class ManifestReader final : public nlohmann::json_sax<json> {
  public:
    /// Once all was read. Throws `WrongManifest`.
    [[nodiscard]] Manifest take() {
        if (format_.kind == Kind::Missing) {
            throw WrongManifest{notWellFormed};
        }
        if (format_.kind != Kind::Number || format_.number != manifestFormat) {
            throw WrongManifest{toTranslate("a later version has written it")};
        }
        for (auto* const part : {&songs_, &strays_, &playlist_, &sent_}) {
            const bool mayBeMissing = part == &playlist_ || part == &sent_;
            if (!part->why.empty() || !(part->isThere || mayBeMissing)) {
                throw WrongManifest{part->why.empty() ? notWellFormed : part->why};
            }
        }
        Manifest manifest{std::move(songs_.entries), {}, std::move(strays_.entries), selection_};
        if (playlist_.isThere) {
            manifest.playlist = std::move(playlist_.entries.front());
        }
        return manifest;
    }

    bool null() override { return scalar({Kind::Other}); }

    bool boolean(bool /*value*/) override { return scalar({Kind::Other}); }

    bool number_integer(number_integer_t value) override {
        return scalar({Kind::NegativeNumber, 0, value});
    }

    bool number_unsigned(number_unsigned_t value) override { return scalar({Kind::Number, value}); }

    bool number_float(number_float_t /*value*/, const string_t& /*text*/) override {
        return scalar({Kind::Other});
    }

    bool string(string_t& value) override {
        requireShallow();
        if (auto* const field = fieldHere()) {
            field->kind = Kind::Text;
            field->text = value;
        } else {
            odd();
        }
        return true;
    }

    bool binary(binary_t& /*value*/) override { return false; }

    bool start_object(std::size_t /*size*/) override {
        const bool isEntryOfList = isInList() && depth_ == 2;
        const bool isOnlyOne = (part_ == &playlist_ || part_ == &sent_) && depth_ == 1;
        if (isEntryOfList || isOnlyOne) {
            fields_.begin(part_ == &sent_ ? namesOfSelection : namesOfEntry);
            depthOfFields_ = depth_ + 1;
        } else if (depth_ > 0) {
            scalar({Kind::Other});
        }
        return deeper();
    }

    bool key(string_t& name) override {
        requireShallow();
        if (depth_ == 1) {
            begin(name);
        } else if (depth_ == depthOfFields_) {
            fields_.choose(name);
        }
        return true;
    }

    bool end_object() override {
        if (depth_-- == depthOfFields_) {
            depthOfFields_ = none;
            finishFields();
        }
        return true;
    }

    bool start_array(std::size_t /*size*/) override {
        if (!isInList() || depth_ != 1) {
            scalar({Kind::Other});
        }
        return deeper();
    }

    bool end_array() override {
        --depth_;
        return true;
    }

    bool parse_error(std::size_t /*position*/, const std::string& /*token*/,
                     const json::exception& /*error*/) override {
        return false;
    }

  private:
    static constexpr std::size_t none = 0;

    /// A member of the manifest.
    struct Part {
        bool isThere = false;
        std::vector<Entry> entries = {};
        /// What is wrong with it; empty where nothing is.
        std::string why = {};
    };

    [[nodiscard]] bool isInList() const { return part_ == &songs_ || part_ == &strays_; }

    /// Each level costs time and memory.
    void requireShallow() const {
        constexpr std::size_t deepest = 8;
        if (depth_ > deepest) {
            throw WrongManifest{toTranslate("it is nested too deeply")};
        }
    }

    bool deeper() {
        requireShallow();
        ++depth_;
        return true;
    }

    /// The last of several members of one name counts.
    void begin(std::string_view name) {
        isFormat_ = name == "format";
        part_ = name == "songs"      ? &songs_
                : name == "strays"   ? &strays_
                : name == "playlist" ? &playlist_
                : name == "sent"     ? &sent_
                                     : nullptr;
        if (part_ != nullptr) {
            *part_ = {true};
        }
    }

    [[nodiscard]] Field* fieldHere() {
        if (depth_ == 1 && isFormat_) {
            return &format_;
        }
        return depth_ == depthOfFields_ ? fields_.chosen() : nullptr;
    }

    bool scalar(const Field& value) {
        requireShallow();
        if (auto* const field = fieldHere()) {
            *field = value;
        } else {
            odd();
        }
        return true;
    }

    /// This is no list, or no entry of one.
    void odd() {
        const bool isPart = depth_ == 1 || (isInList() && depth_ == 2);
        if (isPart && part_ != nullptr) {
            isWrong(notWellFormed);
        }
    }

    void isWrong(const std::string& why) { part_->why = part_->why.empty() ? why : part_->why; }

    void finishFields() {
        try {
            if (part_ == &sent_) {
                selection_ = selectionOf(fields_);
            } else {
                part_->entries.push_back(entryOf(fields_));
            }
        } catch (const WrongManifest& wrong) {
            isWrong(wrong.what());
        }
    }

    std::size_t depth_ = 0;
    /// Of the object whose members are being collected; `none` where no such one is open.
    std::size_t depthOfFields_ = none;
    Fields fields_;
    bool isFormat_ = false;
    Field format_;
    /// Null in one that does not matter.
    Part* part_ = nullptr;
    Part songs_;
    Part strays_;
    Part playlist_;
    Part sent_;
    std::optional<Selection> selection_;
};

template <class Text>
Manifest read(Text&& text) {
    ManifestReader reader;
    if (!json::sax_parse(std::forward<Text>(text), &reader)) {
        throw WrongManifest{notWellFormed};
    }
    return reader.take();
}

} // namespace

Manifest readManifest(std::streambuf& text) {
    std::istream stream(&text);
    return read(stream);
}

Manifest readManifest(std::string_view text) { return read(text); }

} // namespace quorl::wearable
