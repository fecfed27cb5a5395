#include "tests/quorl/QuorlProcess.h"

#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

QProcessEnvironment environmentWith(const Environment& changes) {
    auto environment = QProcessEnvironment::systemEnvironment();
    environment.remove(QStringLiteral("QT_QPA_PLATFORM"));
    for (const char* language : {"LANGUAGE", "LC_ALL", "LC_MESSAGES"}) {
        environment.remove(QString::fromLatin1(language));
    }
    environment.insert(QStringLiteral("LANG"), QStringLiteral("C.UTF-8"));
    for (const auto& [name, value] : changes) {
        if (value.empty()) {
            environment.remove(QString::fromStdString(name));
        } else {
            environment.insert(QString::fromStdString(name), QString::fromStdString(value));
        }
    }
    return environment;
}

QStringList toList(const std::vector<std::string>& texts) {
    QStringList list;
    for (const std::string& text : texts) {
        list << QString::fromStdString(text);
    }
    return list;
}

} // namespace

QuorlProcess::QuorlProcess(const std::vector<std::string>& arguments,
                           const Environment& environment) {
    process_.setProcessEnvironment(environmentWith(environment));
    process_.start(QStringLiteral(QUORL_PROGRAM), toList(arguments));
    if (!process_.waitForStarted(patience)) {
        throw std::runtime_error("quorl does not start");
    }
}

void QuorlProcess::say(const std::string& line) {
    process_.write((line + "\n").c_str());
    process_.waitForBytesWritten(patience);
}

void QuorlProcess::closeInput() { process_.closeWriteChannel(); }

void QuorlProcess::takeOutput() {
    output_ += process_.readAllStandardOutput().toStdString();
    errors_ += process_.readAllStandardError().toStdString();
}

std::string QuorlProcess::readUntil(const std::string& text) {
    return take(output_, QProcess::StandardOutput, text);
}

std::string QuorlProcess::readErrorsUntil(const std::string& text) {
    return take(errors_, QProcess::StandardError, text);
}

std::string QuorlProcess::take(std::string& from, QProcess::ProcessChannel channel,
                               const std::string& text) {
    process_.setReadChannel(channel);
    takeOutput();
    auto found = from.find(text);
    while (found == std::string::npos) {
        if (!process_.waitForReadyRead(patience)) {
            throw std::runtime_error("quorl has not written \"" + text + "\" but: " + output_ +
                                     errors_);
        }
        takeOutput();
        found = from.find(text);
    }
    std::string read = from.substr(0, found + text.size());
    from.erase(0, found + text.size());
    return read;
}

std::optional<std::string> QuorlProcess::wakeUpsOfSleepingThreads() const {
    const auto id = std::to_string(process_.processId());
    std::string wakeUps;
    for (const auto& thread : std::filesystem::directory_iterator("/proc/" + id + "/task")) {
        std::ifstream status(thread.path() / "status");
        for (std::string line; thread.path().filename() != id && std::getline(status, line);) {
            if (line.starts_with("State:") && line.find("sleeping") == std::string::npos) {
                return std::nullopt;
            }
            if (line.find("ctxt_switches:") != std::string::npos) {
                wakeUps += thread.path().filename().string() + ' ' + line + '\n';
            }
        }
    }
    return wakeUps;
}

void QuorlProcess::kill() {
    process_.kill();
    process_.waitForFinished(patience);
}

int QuorlProcess::end() {
    closeInput();
    if (!process_.waitForFinished(patience)) {
        process_.kill();
        throw std::runtime_error("quorl does not end");
    }
    takeOutput();
    return process_.exitStatus() == QProcess::NormalExit ? process_.exitCode() : -1;
}

} // namespace quorl::tests
