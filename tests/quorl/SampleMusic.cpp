#include "tests/quorl/SampleMusic.h"

#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

SampleMusic::SampleMusic() {
    folder_.writeSongs({"one.flac", "two.flac", "three.flac"}, std::size_t{1} << 20U);
    folder_.write("Long Run.m3u8", "#EXTM3U\none.flac\ntwo.flac\nthree.flac\n");
    folder_.write("Morning Mix.m3u8", "#EXTM3U\n#GENERATED:mix\ntwo.flac\n");
    folder_.write("Road Trip.m3u8", "#EXTM3U\none.flac\ngone.flac\n");
    storePreference("music-folder", path());
}

void SampleMusic::addPlaylist(const std::string& name) const {
    folder_.replace(name + ".m3u8", "#EXTM3U\none.flac\n");
}

} // namespace quorl::tests
