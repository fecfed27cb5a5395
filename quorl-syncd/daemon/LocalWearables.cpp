#include "quorl-syncd/daemon/LocalWearables.h"

#include <filesystem>
#include <mutex>
#include <optional>
#include <stdexcept>
#include <system_error>
#include <utility>

#include "quorl-syncd/daemon/Lifeline.h"
#include "quorl-syncd/daemon/WearableWatch.h"
#include "services/base/AtomicFile.h"
#include "services/base/Errand.h"
#include "services/base/Paths.h"
#include "services/language/Translated.h"
#include "services/wearable/Lookout.h"
#include "services/wearable/UsageReader.h"

namespace quorl::syncd {

namespace {

std::string notSaved(const std::system_error& error) {
    return language::filled(
        language::translated("The wearable could not remember how it is attached: {reason}."),
        {{"reason", error.code().message()}});
}

/// What is known of a wearable. Shared with the threads that look at it.
class Known {
  public:
    Known(const wearable::Wearable& wearable, LocalWearables::Objection objection)
        : objection_(std::move(objection)), lookout_(wearable) {}

    [[nodiscard]] wearable::Usage look() {
        requireTheWearable();
        const auto usage = lookout_.look();
        if (identity().isEmbedded()) {
            const auto attachment = wearable::loadAttachment(open(identity()).get());
            const std::scoped_lock lock(mutex_);
            attachment_ = attachment;
        }
        return usage;
    }

    [[nodiscard]] wearable::Wearable identity() const { return lookout_.wearable(); }

    [[nodiscard]] WatchedWearable::Answer
    answerWith(const wearable::UsageReader::Answer& answer) const {
        if (const auto* const unseen = std::get_if<wearable::Unseen>(&answer)) {
            return *unseen;
        }
        const std::scoped_lock lock(mutex_);
        return Sight{identity(), std::get<wearable::Usage>(answer), attachment_};
    }

    /// Gives back an empty text, or a sentence.
    [[nodiscard]] std::string save(const wearable::AttachmentChange& change) const {
        try {
            base::makeDirectories(identity().root); // it may not have been looked at yet
            const auto root = open(identity());
            saveAttachment(root.get(), change.appliedTo(wearable::loadAttachment(root.get())));
            return {};
        } catch (const std::system_error& error) {
            return notSaved(error);
        }
    }

  private:
    /// Throws `wearable::CannotBeSeen` where another one is there.
    void requireTheWearable() const {
        const auto wearable = identity();
        if (wearable.isEmbedded()) {
            return;
        }
        if (auto problem = objection_(wearable.root); !problem.code.empty()) {
            const auto words = engine::sentence(problem);
            throw wearable::CannotBeSeen(std::move(problem), words);
        }
    }

    [[nodiscard]] static base::FileDescriptor open(const wearable::Wearable& wearable) {
        return base::openRoot(wearable.root.c_str());
    }

    const LocalWearables::Objection objection_;
    wearable::Lookout lookout_;
    mutable std::mutex mutex_;
    wearable::Attachment attachment_;
};

class LocalWearable final : public WatchedWearable {
  public:
    LocalWearable(engine::BusLoop& loop, const wearable::Wearable& wearable,
                  const WearablePort::Noticed& noticed, const LocalWearables::Objection& objection)
        : loop_(loop),
          known_(std::make_shared<Known>(wearable, objection)),
          watch_(wearable.root,
                 [mailbox = loop.mailbox(), tell = lifeline_.whileThere(noticed)](
                     WearableNews news) { mailbox->post([tell, news] { tell(news); }); }),
          reader_([known = known_] { return known->look(); }) {}

    [[nodiscard]] wearable::Wearable identity() const override { return known_->identity(); }

    void look(Reply reply) override {
        reader_.ask([this, reply = lifeline_.whileThere(std::move(reply))](
                        const wearable::UsageReader::Answer& answer) {
            loop_.post([reply, answer = known_->answerWith(answer)] { reply(answer); });
        });
    }

    void save(const wearable::AttachmentChange& change, Saved saved) override {
        const auto tell = lifeline_.whileThere(std::move(saved));
        try {
            saving_.emplace(
                [known = known_, change, tell, mailbox = loop_.mailbox()](const std::stop_token&) {
                    mailbox->post([tell, problem = known->save(change)] { tell(problem); });
                },
                patience);
        } catch (const std::system_error& error) {
            loop_.post([tell, problem = notSaved(error)] { tell(problem); });
        }
    }

  private:
    static constexpr std::chrono::seconds patience{1};

    engine::BusLoop& loop_;
    const Lifeline lifeline_;
    const std::shared_ptr<Known> known_;
    WearableWatch watch_;
    wearable::UsageReader reader_;
    std::optional<base::Errand> saving_;
};

} // namespace

std::unique_ptr<WatchedWearable> LocalWearables::watch(const std::string& directory,
                                                       Noticed noticed) {
    const auto wearable = directory.empty()
                              ? wearable::Wearable::embedded(purpose_, embeddedCapacity_)
                              : wearable::Wearable{base::normal(directory), {}, false};
    return std::make_unique<LocalWearable>(loop_, wearable, noticed, objection_);
}

} // namespace quorl::syncd
