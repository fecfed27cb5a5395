#include "quorl/adapters/LoginStart.h"

#include <QCoreApplication>
#include <QStandardPaths>
#include <system_error>

#include "services/base/AtomicFile.h"
#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::translated;

namespace {

constexpr auto fileName = "org.quorl.Velora.Sync.desktop";

/// By this line a file is ours.
constexpr std::string_view mark = "X-Quorl-Written=true\n";

constexpr std::size_t mostBytes = 65'536;

/// In quotes, as the desktop's files have it.
std::string quoted(const std::string& path) {
    std::string text = "\"";
    for (const char byte : path) {
        const bool isSpecial = std::string_view("\"`$\\").find(byte) != std::string_view::npos;
        text += isSpecial ? "\\\\" : byte == '%' ? "%" : "";
        text += byte == '\\' ? "\\\\" : std::string(1, byte);
    }
    return text + "\"";
}

std::string entry() {
    const auto engine = QCoreApplication::applicationDirPath().toStdString() + "/quorl-syncd";
    return "[Desktop Entry]\nType=Application\nName=Velora Music Sync\nExec=" + quoted(engine) +
           "\nNoDisplay=true\n" + std::string(mark);
}

} // namespace

LoginStart::LoginStart(std::filesystem::path directory) : directory_(std::move(directory)) {}

std::filesystem::path LoginStart::usualDirectory() {
    return std::filesystem::path(
               QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation)
                   .toStdString()) /
           "autostart";
}

/// Empty where there is none.
std::string LoginStart::contents() const {
    try {
        return base::readFile(base::openRoot(directory_.c_str()).get(), fileName, mostBytes);
    } catch (const std::system_error&) {
        return {};
    }
}

bool LoginStart::isOn() const {
    const auto text = contents();
    return !text.empty() && text.find("\nHidden=true") == std::string::npos;
}

std::string LoginStart::set(bool isOn) const {
    const auto file = directory_ / fileName;
    const auto text = contents();
    if (!text.empty() && text.find(mark) == std::string::npos) {
        return filled(translated("The file {file} was not written by this app, so it stays as it "
                                 "is. Change or remove it yourself."),
                      {{"file", base::printable(file.string())}});
    }
    try {
        if (isOn) {
            base::makeDirectories(directory_);
            base::replaceFile(base::openRoot(directory_.c_str()).get(), fileName, entry());
        } else {
            std::filesystem::remove(file);
        }
        return {};
    } catch (const std::system_error& error) {
        return filled(
            translated("The file {file} cannot be written: {reason}."),
            {{"file", base::printable(file.string())}, {"reason", error.code().message()}});
    }
}

} // namespace quorl
