#include <gtest/gtest.h>

#include "platform/http.h"
#include "support/loopback_server.h"

namespace kestrune::platform {
namespace {

std::string Body(const HttpResponse& response) { return std::string(response.body.begin(), response.body.end()); }

TEST(HttpClient, GetsAndPostsNameValuePairsToALoopbackServer) {
  test::LoopbackServer server;
  auto client = MakeSystemHttpClient();
  HttpRequest get{server.Url("/echo"), false, {{u"a", u"1"}, {u"b", u"x y"}}};
  HttpResponse answer = client->Fetch(get);
  ASSERT_TRUE(answer.completed) << answer.error;
  EXPECT_EQ(answer.status, 200u);
  EXPECT_EQ(Body(answer), "GET /echo?a=1&b=x+y ");

  HttpRequest post{server.Url("/form"), true, {{u"name", u"Straße"}, {u"v", u"&="}}};
  answer = client->Fetch(post);
  ASSERT_TRUE(answer.completed) << answer.error;
  EXPECT_EQ(Body(answer), "POST /form name=Stra%C3%9Fe&v=%26%3D");
}

TEST(HttpClient, ReportsStatusesAndFailuresApart) {
  auto client = MakeSystemHttpClient();
  std::u16string closedPort;
  {
    test::LoopbackServer server;
    HttpResponse missing = client->Fetch({server.Url("/status/404"), false, {}});
    ASSERT_TRUE(missing.completed) << missing.error;
    EXPECT_EQ(missing.status, 404u);
    closedPort = server.Url("/gone");
  }
  HttpResponse refused = client->Fetch({closedPort, false, {}});
  EXPECT_FALSE(refused.completed);
  EXPECT_FALSE(refused.error.empty());
  EXPECT_TRUE(refused.body.empty());
}

TEST(HttpForm, EncodesQueriesOnlyForGets) {
  EXPECT_EQ(EncodeForm({{u"a b", u"c/d"}, {u"e", u""}}), "a+b=c%2Fd&e=");
  EXPECT_EQ(UrlWithQuery({u"http://h/p?x=1", false, {{u"y", u"2"}}}), u"http://h/p?x=1&y=2");
  EXPECT_EQ(UrlWithQuery({u"http://h/p", true, {{u"y", u"2"}}}), u"http://h/p");
}

}  // namespace
}  // namespace kestrune::platform
