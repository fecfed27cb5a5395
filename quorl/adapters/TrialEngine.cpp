#include "quorl/adapters/TrialEngine.h"

#include <QCoreApplication>

#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

constexpr int mostMilliseconds = 5'000;

/// quorl-syncd: another one runs with the name of a trial.
constexpr int alreadyRunning = 3;

} // namespace

TrialEngine::TrialEngine(const Problem& problem) {
    process_.setProcessChannelMode(QProcess::ForwardedChannels);
    QObject::connect(
        &process_, &QProcess::errorOccurred, &process_,
        [this, problem](QProcess::ProcessError error) {
            if (error == QProcess::FailedToStart) {
                problem(language::filled(translated("The sync engine of this trial does not start "
                                                    "({reason}). Install quorl-syncd again."),
                                         {{"reason", process_.errorString().toStdString()}}));
            }
        });
    QObject::connect(&process_, &QProcess::finished, &process_, [problem](int code) {
        if (code == alreadyRunning) {
            problem(translated("Another trial is running. End that one first."));
        }
    });
    process_.start(QCoreApplication::applicationDirPath() + QStringLiteral("/quorl-syncd"),
                   {QStringLiteral("--trial")});
}

TrialEngine::~TrialEngine() {
    QObject::disconnect(&process_, nullptr, nullptr, nullptr);
    process_.closeWriteChannel();
    process_.waitForFinished(mostMilliseconds);
}

} // namespace quorl
