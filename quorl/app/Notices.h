#pragma once

#include <QObject>
#include <functional>
#include <map>
#include <string>
#include <vector>

namespace quorl {

/// Something that a person has to be told without being interrupted.
struct Notice {
    std::string text; ///< what is the matter and what to do; empty for nothing
    /// What a button beside it is called; empty for no button.
    std::string actionName = {};
    std::function<void()> act = {}; ///< what the button does
};

/// What there is to be told, at the most one notice for each topic. Main thread.
class Notices final : public QObject {
    Q_OBJECT

  public:
    /// The graver ones come first.
    enum class Topic {
        Pane,
        SessionBus,
        Engine,
        TrialEngine,
        Preferences,
        MusicFolder,
        Request,
        Watching
    };

    /// Puts `notice` in place of what the topic had; one without a text takes it away.
    void set(Topic topic, Notice notice);

    void set(Topic topic, const std::string& text) { set(topic, Notice{text}); }

    /// By topic.
    [[nodiscard]] const std::map<Topic, Notice>& all() const { return notices_; }

    /// In the order of the topics.
    [[nodiscard]] std::vector<std::string> texts() const;

  Q_SIGNALS:
    /// A topic has another text now; not emitted when one was taken away.
    void added(const std::string& text);

    void changed();

  private:
    std::map<Topic, Notice> notices_; ///< with a text each
};

} // namespace quorl
