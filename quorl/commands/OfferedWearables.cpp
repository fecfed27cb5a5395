#include "quorl/commands/OfferedWearables.h"

#include <algorithm>
#include <iterator>

#include "services/base/Paths.h"
#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::translated;

namespace {

using Directory = std::variant<std::filesystem::path, std::string>;

constexpr auto thisDevice = "this-device";

Directory ambiguous(const std::string& name, const std::vector<finding::Offer>& offers) {
    auto text = filled(
        translated(
            "Several wearables are called {name}. Give the directory of one of them instead:"),
        {{"name", base::printable(name)}});
    for (const auto& offer : offers) {
        text += "\n  " + base::printable(offer.directory.string());
    }
    return text;
}

Directory notFound(const std::string& name) {
    return filled(translated("There is no wearable called {name}. 'quorl --wearables' lists those "
                             "that can be chosen; a directory is given with its path."),
                  {{"name", base::printable(name)}});
}

} // namespace

Directory findOffered(const finding::Found& found, const std::string& nameOrPath) {
    if (nameOrPath == thisDevice) {
        return std::filesystem::path();
    }
    std::vector<finding::Offer> named;
    std::ranges::copy_if(found.offers, std::back_inserter(named), [&](const auto& offer) {
        return base::composed(offer.name) == base::composed(nameOrPath);
    });
    if (named.size() > 1) {
        return ambiguous(nameOrPath, named);
    }
    if (!named.empty()) {
        return named.front().directory;
    }
    return nameOrPath.find('/') == std::string::npos
               ? notFound(nameOrPath)
               : Directory(base::normal(std::filesystem::absolute(nameOrPath)));
}

} // namespace quorl
