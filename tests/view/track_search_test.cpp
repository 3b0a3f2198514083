#include "view/track_search.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrune {
namespace {

std::vector<std::uint32_t> Ids(const std::vector<Track>& tracks) {
  std::vector<std::uint32_t> ids;
  for (const Track& track : tracks) ids.push_back(track.trackId);
  return ids;
}

TEST(SearchTracks, MatchesAcrossFieldsInAnyAsciiCaseInAscendingId) {
  std::map<std::uint32_t, Track> tracks;
  auto add = [&](std::uint32_t id, std::u16string title, std::u16string artist) {
    Track& track = tracks[id];
    track.trackId = id;
    track.title = std::move(title);
    track.artist = std::move(artist);
  };
  add(9, u"BEATS", u"");
  add(3, u"Help", u"Beatles");
  add(5, u"To Be", u"at Night");  // "Be" + "at" spans the two fields
  add(7, u"Beta", u"");
  EXPECT_THAT(Ids(SearchTracks(tracks, u"beat")), ::testing::ElementsAre(3, 5, 9));
}

TEST(SearchTracks, UpperCasesOnlyTheAsciiLetters) {
  std::map<std::uint32_t, Track> tracks;
  tracks[1].trackId = 1;
  tracks[1].title = u"caf\u00E9";
  tracks[2].trackId = 2;
  tracks[2].genre = u"CAF\u00C9";
  EXPECT_THAT(Ids(SearchTracks(tracks, u"CAF\u00E9")), ::testing::ElementsAre(1));
  EXPECT_THAT(Ids(SearchTracks(tracks, u"caf\u00C9")), ::testing::ElementsAre(2));
}

}  // namespace
}  // namespace kestrune
