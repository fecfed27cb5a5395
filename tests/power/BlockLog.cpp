#include "tests/power/BlockLog.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace quorl::power {

namespace {

/// Of a write of many sectors, these many places to cut it are as good as all.
constexpr std::size_t mostCutsOfAWrite = 8;

void write(const BlockLog::Write& write, std::size_t bytes, std::string& disk) {
    const auto end = std::min<std::size_t>(write.offset + bytes, disk.size());
    std::copy_n(write.bytes.begin(), end - write.offset,
                disk.begin() + static_cast<std::ptrdiff_t>(write.offset));
}

} // namespace

BlockLog parseBlockLog(const std::string& text) {
    BlockLog log;
    std::array<std::uint64_t, 2> head{};
    for (std::size_t at = 0; at + sizeof head <= text.size(); at += sizeof head + head[1]) {
        std::memcpy(head.data(), text.data() + at, sizeof head);
        if (at + sizeof head + head[1] <= text.size()) {
            log.writes.push_back({head[0], text.substr(at + sizeof head, head[1])});
        }
    }
    return log;
}

std::vector<PowerCut> powerCuts(const BlockLog& log) {
    std::vector<PowerCut> cuts{{0}};
    for (std::size_t at = 0; at < log.writes.size(); ++at) {
        const auto sectors = log.writes[at].bytes.size() / sectorSize;
        const auto step = std::max<std::size_t>(sectors / mostCutsOfAWrite, 1);
        for (auto sector = step; sector < sectors; sector += step) {
            cuts.push_back({at, sector});
        }
        cuts.push_back({at + 1});
    }
    return cuts;
}

void apply(const BlockLog& log, const PowerCut& cut, std::string& disk) {
    for (std::size_t at = 0; at < cut.whole; ++at) {
        write(log.writes[at], log.writes[at].bytes.size(), disk);
    }
    if (cut.sectors > 0) {
        write(log.writes[cut.whole], cut.sectors * sectorSize, disk);
    }
}

std::string toText(const PowerCut& cut) {
    return "after " + std::to_string(cut.whole) + " writes" +
           (cut.sectors > 0 ? " and " + std::to_string(cut.sectors) + " sectors" : "");
}

} // namespace quorl::power
