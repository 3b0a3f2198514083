#include <map>

#include "base/paths.h"
#include "base/utf.h"
#include "html/css/computed_style.h"
#include "html/host/url.h"
#include "page_fixture.h"
#include "support/temp_folder.h"

namespace kestrune::html::test {
namespace {

// Serves files from a map through the load-data notification and writes down every request.
struct FileServer {
  std::map<std::u16string, std::string> files;
  std::vector<std::u16string> requested;
  std::vector<unsigned> types;
  bool answerWithOutData = false;
  int completes = 0;

  static std::intptr_t Callback(unsigned message, std::uintptr_t, std::intptr_t lParam, void* context) {
    auto& self = *static_cast<FileServer*>(context);
    EXPECT_EQ(message, host::kWmNotify);
    auto* header = reinterpret_cast<host::NotificationHeader*>(lParam);
    if (header->code == host::kNotifyDocumentComplete) ++self.completes;
    if (header->code != host::kNotifyLoadData) return 0;
    auto* request = reinterpret_cast<host::LoadDataNotification*>(header);
    self.requested.emplace_back(request->uri);
    self.types.push_back(request->dataType);
    auto found = self.files.find(request->uri);
    if (found == self.files.end()) return 0;
    const auto* bytes = reinterpret_cast<const unsigned char*>(found->second.data());
    if (self.answerWithOutData) {
      request->outData = bytes;
      request->outDataSize = static_cast<unsigned>(found->second.size());
    } else {
      HTMLayoutDataReady(header->window, request->uri, bytes, found->second.size());
    }
    return 0;
  }
};

css::Color ColorOf(HELEMENT e) { return e->style()->color; }

class LoadingTest : public PageTest {
 protected:
  void SetUp() override { HTMLayoutSetCallback(window_, &FileServer::Callback, &server_); }
  FileServer server_;
};

TEST_F(LoadingTest, AsksForEverySheetAndImageByTheUrlThePageWrites) {
  server_.files[u"styles/main.css"] = "@import 'more.css'; p { color: #00ff00; background-image: url(img/bg.png) }";
  server_.files[u"styles/more.css"] = "span { color: #0000ff }";
  server_.files[u"images/logo.png"] = "PNG";
  Load("<html><head><link rel=\"stylesheet\" href=\"styles/main.css\"><link rel=icon href=x.ico></head>"
       "<body><p id=p>a</p><span id=s>b</span><img src=\"images/logo.png\"><img src=\"images/missing.png\"></body></html>");
  EXPECT_EQ(server_.requested, (std::vector<std::u16string>{u"styles/main.css", u"styles/more.css", u"styles/img/bg.png",
                                                            u"images/logo.png", u"images/missing.png"}));
  EXPECT_EQ(server_.types, (std::vector<unsigned>{events::kDataStyle, events::kDataStyle, events::kDataImage,
                                                  events::kDataImage, events::kDataImage}));
  EXPECT_EQ(ColorOf(Find("#p")), 0xFF00FF00u);
  EXPECT_EQ(ColorOf(Find("#s")), 0xFF0000FFu);
  EXPECT_EQ(Find("#p")->style()->backgroundImage, u"styles/img/bg.png");
  ASSERT_NE(window_->Resource(u"images/logo.png"), nullptr);
  EXPECT_EQ(window_->Resource(u"images/logo.png")->size(), 3u);
  EXPECT_EQ(window_->Resource(u"images/missing.png"), nullptr);
  EXPECT_EQ(server_.completes, 1);
}

TEST_F(LoadingTest, AsksForTheImagesOfHtmlSetIntoAnElementOnce) {
  server_.files[u"a.png"] = "PNG";
  Load("<body><div id=d></div></body>");
  server_.requested.clear();
  auto set = [&](const std::string& html, unsigned where) {
    HTMLayoutSetElementHtml(Find("#d"), reinterpret_cast<const unsigned char*>(html.data()), html.size(), where);
  };
  set("<span><IMG src=a.png></span><p>no image here: &lt;img</p><img src=b.png><img>", kReplaceContent);
  EXPECT_EQ(server_.requested, (std::vector<std::u16string>{u"a.png", u"b.png"}));
  ASSERT_NE(window_->Resource(u"a.png"), nullptr);
  set("<img src=a.png><b><img src=c.png></b>", kAppendAfterLast);  // a.png is held already
  EXPECT_EQ(server_.requested, (std::vector<std::u16string>{u"a.png", u"b.png", u"c.png"}));
}

TEST_F(LoadingTest, AcceptsAnAnswerInTheNotificationItself) {
  server_.answerWithOutData = true;
  server_.files[u"a.css"] = "b { color: red }";
  Load("<link rel=stylesheet href=a.css><style>i { color: blue }</style><b id=b>x</b><i id=i>y</i>");
  EXPECT_EQ(ColorOf(Find("#b")), 0xFFFF0000u);
  EXPECT_EQ(ColorOf(Find("#i")), 0xFF0000FFu);
}

TEST_F(LoadingTest, LoadsFilesItselfRelativeToTheDocumentWhenTheProgramHasNone) {
  kestrune::test::TempFolder folder;
  std::filesystem::create_directories(folder / "css");
  kestrune::test::WriteBytes(folder / "css" / "page.css", {'u', '{', 'c', 'o', 'l', 'o', 'r', ':', 'r', 'e', 'd', '}'});
  const std::string page = "<link rel=stylesheet href='css/page.css'><u id=u>x</u>";
  const std::u16string base = TextFromPath(folder / "page.htm");
  HTMLayoutLoadHtmlEx(window_, reinterpret_cast<const unsigned char*>(page.data()), page.size(), base.c_str());
  EXPECT_EQ(server_.requested.size(), 1u);
  EXPECT_EQ(ColorOf(Find("#u")), 0xFFFF0000u);

  // From memory (no document URL) a relative name stays as written and is not guessed at.
  server_.requested.clear();
  Load(page);
  EXPECT_EQ(server_.requested, (std::vector<std::u16string>{u"css/page.css"}));
  EXPECT_NE(ColorOf(Find("#u")), 0xFFFF0000u);
}

TEST_F(LoadingTest, OffersBehaviorsToTheProgramFirstAndFallsBackToBuiltInControls) {
  struct Program {
    std::vector<std::string> asked;
    static bool Handler(void*, HELEMENT, unsigned, void*) { return false; }
    static std::intptr_t Callback(unsigned, std::uintptr_t, std::intptr_t lParam, void* context) {
      auto* header = reinterpret_cast<host::NotificationHeader*>(lParam);
      if (header->code != host::kNotifyAttachBehavior) return 0;
      auto* attach = reinterpret_cast<host::AttachBehaviorNotification*>(header);
      static_cast<Program*>(context)->asked.emplace_back(attach->behaviorName);
      if (std::string(attach->behaviorName) == "hyperlink" || std::string(attach->behaviorName) == "grid") {
        attach->elementProc = &Handler;
        attach->elementTag = context;
        attach->elementEvents = events::kHandleMouse;
      }
      return 0;
    }
  } program;
  HTMLayoutSetCallback(window_, &Program::Callback, &program);
  Load("<style>table { behavior: grid } #x { behavior: button unknown-one }</style>"
       "<table id=t><tr><td>1</td></tr></table><a id=a href=x>link</a><div id=x>x</div><input type=checkbox id=c>");
  EXPECT_EQ(program.asked, (std::vector<std::string>{"grid", "hyperlink", "button", "unknown-one", "checkbox"}));
  unsigned type = 99;
  HTMLayoutControlGetType(Find("#a"), &type);
  EXPECT_EQ(type, controls::kCtlUnknown);  // the program's hyperlink, not the engine's
  HTMLayoutControlGetType(Find("#x"), &type);
  EXPECT_EQ(type, controls::kCtlButton);
  HTMLayoutControlGetType(Find("#c"), &type);
  EXPECT_EQ(type, controls::kCtlCheckbox);
  HTMLayoutControlGetType(Find("#t > tr > td"), &type);
  EXPECT_EQ(type, controls::kCtlNo);
}

TEST(CombineUrl, MakesUrlsAbsoluteAgainstTheReferringDocument) {
  using host::CombineUrl;
  EXPECT_EQ(CombineUrl(u"", u"styles/main.css"), u"styles/main.css");
  EXPECT_EQ(CombineUrl(u"http://host/a/b/page.htm", u"c.css"), u"http://host/a/b/c.css");
  EXPECT_EQ(CombineUrl(u"http://host/a/b/page.htm", u"../c.css"), u"http://host/a/c.css");
  EXPECT_EQ(CombineUrl(u"http://host/a/b/page.htm", u"/root.css"), u"http://host/root.css");
  EXPECT_EQ(CombineUrl(u"http://host/a/page.htm?x=1", u"#top"), u"http://host/a/page.htm?x=1#top");
  EXPECT_EQ(CombineUrl(u"http://host/a/page.htm#old", u"#new"), u"http://host/a/page.htm#new");
  EXPECT_EQ(CombineUrl(u"http://host", u"x.htm"), u"http://host/x.htm");
  EXPECT_EQ(CombineUrl(u"http://host/a/", u"https://other/x"), u"https://other/x");
  EXPECT_EQ(CombineUrl(u"file:///C:/ui/main.htm", u"./img/./a.png"), u"file:///C:/ui/img/a.png");
  EXPECT_EQ(CombineUrl(u"C:\\ui\\main.htm", u"img\\a.png"), u"C:\\ui\\img\\a.png");
  EXPECT_EQ(CombineUrl(u"C:\\ui\\main.htm", u"D:\\x.png"), u"D:\\x.png");
  EXPECT_EQ(CombineUrl(u"/srv/ui/main.htm", u"../x/../y.css"), u"/srv/y.css");
  EXPECT_EQ(CombineUrl(u"styles/main.css", u"more.css"), u"styles/more.css");
  EXPECT_EQ(host::LocalPath(u"file:///C:/a%20b.htm"), u"C:/a b.htm");
  EXPECT_EQ(host::LocalPath(u"file:///srv/a.htm"), u"/srv/a.htm");
  EXPECT_FALSE(host::IsLocalFile(u"http://host/x"));
}

}  // namespace
}  // namespace kestrune::html::test
