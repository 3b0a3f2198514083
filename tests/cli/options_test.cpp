#include "cli/options.h"

#include <gtest/gtest.h>

namespace kestrune::cli {
namespace {

std::optional<Options> Parse(std::vector<std::u16string> arguments) {
  std::string error;
  return ParseOptions(arguments, error);
}

TEST(ParseOptions, ReadsListOptions) {
  const auto options =
      Parse({u"list", u"--device", u"/media/ipod", u"--playlist", u"-1", u"--json"});
  ASSERT_TRUE(options.has_value());
  EXPECT_EQ(options->command, Command::kList);
  EXPECT_EQ(options->device, u"/media/ipod");
  EXPECT_EQ(options->playlist, -1);
  EXPECT_TRUE(options->json);
}

TEST(ParseOptions, RefusesWhatItDoesNotKnow) {
  EXPECT_FALSE(Parse({u"lsit"}).has_value());
  EXPECT_FALSE(Parse({u"list", u"--device"}).has_value());
  EXPECT_FALSE(Parse({u"list", u"--playlist", u"-2"}).has_value());
  EXPECT_FALSE(Parse({u"list", u"--playlist", u"x"}).has_value());
  EXPECT_FALSE(Parse({u"devices", u"--json"}).has_value());
  EXPECT_EQ(Parse({})->command, Command::kHelp);
}

}  // namespace
}  // namespace kestrune::cli

namespace kestrune::cli {
namespace {

TEST(ParseOptions, ReadsExportOptions) {
  const auto options = Parse({u"export", u"--device", u"d", u"--out", u"o", u"--flat", u"--ids",
                              u"52,53,52", u"--playlists-m3u"});
  ASSERT_TRUE(options.has_value());
  EXPECT_EQ(options->command, Command::kExport);
  EXPECT_EQ(options->out, u"o");
  EXPECT_EQ(options->organized, false);
  EXPECT_EQ(options->ids, (std::vector<std::uint32_t>{52, 53, 52}));
  EXPECT_TRUE(options->playlistsM3u);
  EXPECT_EQ(Parse({u"export", u"--search", u"beat", u"--organized"})->organized, true);
  EXPECT_FALSE(Parse({u"export", u"--all"})->organized.has_value());  // the stored option then
}

TEST(ParseOptions, AnExportChoosesItsTracksExactlyOneWay) {
  std::string error;
  EXPECT_FALSE(ParseOptions({u"export"}, error).has_value());
  EXPECT_NE(error.find("exactly one of"), std::string::npos);
  EXPECT_FALSE(Parse({u"export", u"--all", u"--playlist", u"0"}).has_value());
  EXPECT_FALSE(Parse({u"export", u"--search", u""}).has_value());
  EXPECT_FALSE(Parse({u"export", u"--ids", u"52,,53"}).has_value());
  EXPECT_FALSE(Parse({u"export", u"--ids", u"-1"}).has_value());
  EXPECT_FALSE(Parse({u"list", u"--all"}).has_value());
  EXPECT_TRUE(Parse({u"export", u"--playlist", u"2"}).has_value());
}

}  // namespace
}  // namespace kestrune::cli
