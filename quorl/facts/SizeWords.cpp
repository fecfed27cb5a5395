#include "quorl/facts/SizeWords.h"

#include "platform/SizeFormatter.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::translated;

std::string sizeWords(std::uint64_t bytes) { return CPFSSizeStrings(static_cast<float>(bytes)); }

std::string freeSpaceWords(std::uint64_t available, std::uint64_t capacity) {
    return filled(translated("{available} of {capacity} free"),
                  {{"available", sizeWords(available)}, {"capacity", sizeWords(capacity)}});
}

std::string songsWords(std::uint64_t count) {
    return language::translatedCount("{count} song", "{count} songs", count);
}

std::string songsWords(std::uint64_t count, std::uint64_t bytes) {
    return count == 0 ? translated("None")
                      : filled(translated("{songs}, {size}"),
                               {{"songs", songsWords(count)}, {"size", sizeWords(bytes)}});
}

} // namespace quorl
