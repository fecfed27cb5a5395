#include "quorl-syncd/transfer/device/DeviceNames.h"

#include <algorithm>
#include <array>
#include <functional>

#include <unicode/unistr.h>

#include "services/base/Utf8.h"

namespace quorl::syncd {

namespace {

constexpr std::size_t longestName = 255;
constexpr std::size_t longestExtension = 16;
constexpr char replacement = '_';

/// Of the names that Windows takes for devices, whatever extension they have.
constexpr std::array<std::string_view, 6> devices{"con", "prn", "aux", "nul", "conin$", "conout$"};
constexpr std::array<std::string_view, 2> numberedDevices{"com", "lpt"};
constexpr std::array<std::string_view, 13> deviceNumbers{"0", "1", "2", "3", "4", "5", "6",
                                                         "7", "8", "9", "¹", "²", "³"};

/// Case-folded and composed, so that names which a device takes for one are equal.
std::string folded(std::string_view name) {
    std::string result;
    icu::UnicodeString::fromUTF8({name.data(), static_cast<std::int32_t>(name.size())})
        .foldCase()
        .toUTF8String(result);
    return base::composed(result);
}

bool isAllowed(char byte) {
    constexpr std::string_view reserved = "\"*/:<>?\\|\x7F";
    const bool isControl = static_cast<unsigned char>(byte) < ' ';
    return !isControl && reserved.find(byte) == std::string_view::npos;
}

bool isDevice(std::string_view name) {
    auto stem = folded(name.substr(0, name.find('.')));
    stem.erase(stem.find_last_not_of(' ') + 1);
    if (std::ranges::find(devices, stem) != devices.end()) {
        return true;
    }
    return std::ranges::any_of(numberedDevices, [&](std::string_view device) {
        return stem.starts_with(device) &&
               std::ranges::find(deviceNumbers, std::string_view{stem}.substr(device.size())) !=
                   deviceNumbers.end();
    });
}

/// The place where the extension begins, with its dot; the end where there is none.
std::size_t extensionAt(std::string_view name) {
    const auto dot = name.rfind('.');
    const bool isExtension =
        dot != std::string_view::npos && dot > 0 && name.size() - dot <= longestExtension;
    return isExtension ? dot : name.size();
}

/// At most `size` bytes from the beginning, with no character cut.
std::string_view beginning(std::string_view text, std::size_t size) {
    const auto continues = [&](std::size_t at) {
        return (static_cast<unsigned char>(text[at]) & 0xC0U) == 0x80U;
    };
    if (size >= text.size()) {
        return text;
    }
    while (size > 0 && continues(size)) {
        --size;
    }
    return text.substr(0, size);
}

/// `name` with `suffix` before its extension, shortened where it has to be.
std::string withSuffix(std::string_view name, std::string_view suffix) {
    const auto extension = name.substr(extensionAt(name));
    const auto stem = name.substr(0, extensionAt(name));
    std::string result{beginning(stem, longestName - suffix.size() - extension.size())};
    return result.append(suffix).append(extension);
}

} // namespace

std::string deviceName(std::string_view name) {
    auto result = base::composed(base::validUtf8(name));
    std::ranges::replace_if(result, std::not_fn(isAllowed), replacement);
    if (isDevice(result) || result.starts_with('.')) {
        result.insert(result.begin(), replacement);
    }
    result = withSuffix(result, "");
    while (result.ends_with('.') || result.ends_with(' ')) {
        result.pop_back();
    }
    return result.empty() ? std::string{replacement} : result;
}

TakenNames::Key TakenNames::keyOf(std::string_view name) { return wearable::hashOf(folded(name)); }

void TakenNames::add(std::string_view name) { taken_.insert(keyOf(name)); }

bool TakenNames::insert(const Key& key) {
    ++lookUps_;
    return taken_.insert(key).second;
}

std::string TakenNames::take(std::string_view name) {
    constexpr int firstNumber = 2;
    auto wanted = deviceName(name);
    const auto key = keyOf(wanted);
    if (insert(key)) {
        return wanted;
    }
    auto& number = numbers_.try_emplace(key, firstNumber).first->second;
    for (;;) {
        auto free = withSuffix(wanted, " (" + std::to_string(number++) + ")");
        if (insert(keyOf(free))) {
            return free;
        }
    }
}

} // namespace quorl::syncd
