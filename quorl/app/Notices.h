#pragma once

#include <QObject>
#include <map>
#include <string>
#include <vector>

namespace quorl {

/// What the user has to be told without being interrupted, at the most one text for each topic.
/// Main thread.
class Notices final : public QObject {
    Q_OBJECT

  public:
    enum class Topic { Pane, SessionBus, TrialEngine, Preferences, MusicFolder, Watching };

    /// Puts `text` in place of what the topic had; an empty one takes it away.
    void set(Topic topic, const std::string& text);

    /// In the order of the topics.
    [[nodiscard]] std::vector<std::string> texts() const;

  Q_SIGNALS:
    /// A topic has another text now; not emitted when one was taken away.
    void added(const std::string& text);

    void changed();

  private:
    std::map<Topic, std::string> texts_;
};

} // namespace quorl
