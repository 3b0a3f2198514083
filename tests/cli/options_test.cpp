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
