#include <atomic>
#include <thread>

#include "base/utf.h"
#include "page_fixture.h"

namespace kestrune::html::test {
namespace {

class ApiTest : public PageTest {
 protected:
  void SetUp() override {
    Load("<body><table id=list></table><div id=box><p id=first>1</p><p id=second>2</p></div></body>");
    list_ = Find("#list");
  }

  void SetHtml(HELEMENT e, std::string_view html, unsigned where = kReplaceContent) {
    ASSERT_EQ(HTMLayoutSetElementHtml(e, reinterpret_cast<const unsigned char*>(html.data()), html.size(), where),
              DomResult::kOk);
  }

  std::string Html(HELEMENT e, bool outer = false) {
    std::string html;
    HTMLayoutGetElementHtml(e, &html, outer);
    return html;
  }

  std::vector<std::u16string> Ids(HELEMENT parent) {
    std::vector<std::u16string> ids;
    unsigned count = 0;
    HTMLayoutGetChildrenCount(parent, &count);
    for (unsigned i = 0; i < count; ++i) {
      HELEMENT child = nullptr;
      HTMLayoutGetNthChild(parent, i, &child);
      ids.push_back(Id(child));
    }
    return ids;
  }

  HELEMENT list_ = nullptr;
};

std::string TrackRows(int count) {
  std::string rows;
  for (int i = 1; i <= count; ++i) {
    rows += "<tr><td>" + std::to_string(i) +
            "</td><td><input type=\"checkbox\" action=\"musicselection\" id=\"musicselection\">Title " +
            std::to_string(i) + "</td><td>3:07</td><td>Artist</td><td>Album</td><td>Genre</td><td/>";
  }
  return rows;
}

TEST_F(ApiTest, ReplacesAnElementsContentWithTrackRowsAndFindsEachRowsTickBox) {
  SetHtml(list_, TrackRows(40));
  unsigned rows = 0;
  HTMLayoutGetChildrenCount(list_, &rows);
  ASSERT_EQ(rows, 40u);
  for (unsigned i = 0; i < rows; ++i) {
    HELEMENT row = nullptr;
    HTMLayoutGetNthChild(list_, i, &row);
    unsigned cells = 0;
    HTMLayoutGetChildrenCount(row, &cells);
    EXPECT_EQ(cells, 7u);
    HELEMENT box = Find("[id='musicselection']", row);
    ASSERT_NE(box, nullptr);
    HELEMENT parent = nullptr;
    HTMLayoutGetParentElement(box, &parent);
    HELEMENT cell = nullptr;
    HTMLayoutGetNthChild(row, 1, &cell);
    EXPECT_EQ(parent, cell);
  }
  // Every tick box got the engine's check box.
  unsigned type = 0;
  HTMLayoutControlGetType(Find("#musicselection"), &type);
  EXPECT_EQ(type, controls::kCtlCheckbox);
  // Replacing again leaves only the new rows.
  SetHtml(list_, TrackRows(2));
  HTMLayoutGetChildrenCount(list_, &rows);
  EXPECT_EQ(rows, 2u);
}

TEST_F(ApiTest, InsertsHtmlInEveryModeAndWritesItBack) {
  HELEMENT box = Find("#box");
  HELEMENT second = Find("#second");
  SetHtml(box, "<i id=start></i>", kInsertAtStart);
  SetHtml(box, "<i id=end></i>", kAppendAfterLast);
  SetHtml(second, "<b id=before></b>", kInsertBefore);
  SetHtml(second, "<b id=after></b>", kInsertAfter);
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"start", u"first", u"before", u"second", u"after", u"end"}));
  SetHtml(second, "<u id=instead>x &amp; y</u>", kReplaceElement);
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"start", u"first", u"before", u"instead", u"after", u"end"}));
  EXPECT_EQ(Html(Find("#instead"), true), "<u id=\"instead\">x &amp; y</u>");
  EXPECT_EQ(Html(Find("#first")), "1");

  HTMLayoutSetElementInnerText16(box, u"<plain>", 7);
  EXPECT_EQ(Html(box), "&lt;plain&gt;");
  unsigned count = 1;
  HTMLayoutGetChildrenCount(box, &count);
  EXPECT_EQ(count, 0u);
  EXPECT_EQ(HTMLayoutSetElementHtml(Root(), nullptr, 0, kInsertBefore), DomResult::kInvalidParameter);  // no parent
}

TEST_F(ApiTest, AHeldElementOutlivesItsPlaceInTheTree) {
  SetHtml(list_, TrackRows(3));
  HELEMENT row = nullptr;
  HTMLayoutGetNthChild(list_, 1, &row);
  HTMLayout_UseElement(row);
  EXPECT_EQ(row->refCount(), 2u);  // the table's and ours
  SetHtml(list_, TrackRows(1));
  EXPECT_EQ(row->refCount(), 1u);
  HELEMENT parent = list_;
  HTMLayoutGetParentElement(row, &parent);
  EXPECT_EQ(parent, nullptr);
  EXPECT_EQ(Text(Find("td", row)), u"2");  // still whole and readable
  HLWINDOW window = window_;
  EXPECT_EQ(HTMLayoutGetElementHwnd(row, &window), DomResult::kPassiveHandle);
  // Put back, it is styled and gets its behaviors again.
  ASSERT_EQ(HTMLayoutInsertElement(row, list_, 0), DomResult::kOk);
  unsigned type = 0;
  HTMLayoutControlGetType(Find("input", row), &type);
  EXPECT_EQ(type, controls::kCtlCheckbox);
  HTMLayout_UnuseElement(row);
  EXPECT_EQ(row->refCount(), 1u);
}

TEST_F(ApiTest, CreatesInsertsSortsSwapsAndDeletesElements) {
  HELEMENT box = Find("#box");
  for (const char16_t* name : {u"c", u"A", u"b"}) {
    HELEMENT created = nullptr;
    ASSERT_EQ(HTMLayoutCreateElement("option", name, &created), DomResult::kOk);
    HTMLayoutSetAttributeByName(created, "id", name);
    HTMLayoutInsertElement(created, box, 99);
    HTMLayout_UnuseElement(created);  // the tree holds it now
  }
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"first", u"second", u"c", u"A", u"b"}));
  auto byText = [](HELEMENT a, HELEMENT b, void*) {
    return dom::InnerText(*a).compare(dom::InnerText(*b));
  };
  ASSERT_EQ(HTMLayoutSortElements(box, 2, 5, byText, nullptr), DomResult::kOk);
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"first", u"second", u"A", u"b", u"c"}));  // ordinal: capitals first
  EXPECT_EQ(HTMLayoutSortElements(box, 3, 9, byText, nullptr), DomResult::kInvalidParameter);
  HTMLayoutSwapElements(Find("#first"), Find("#c"));
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"c", u"second", u"A", u"b", u"first"}));
  HTMLayoutInsertElement(Find("#first"), box, 1);  // moving within the parent
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"c", u"first", u"second", u"A", u"b"}));
  unsigned index = 0;
  HTMLayoutGetElementIndex(Find("#second"), &index);
  EXPECT_EQ(index, 2u);
  HTMLayoutDeleteElement(Find("#A"));
  EXPECT_EQ(Ids(box), (std::vector<std::u16string>{u"c", u"first", u"second", u"b"}));
  EXPECT_EQ(HTMLayoutInsertElement(box, Find("#b"), 0), DomResult::kInvalidParameter);  // into itself
}

TEST_F(ApiTest, VisitsAndSelectsInDocumentOrder) {
  SetHtml(list_, TrackRows(3));
  std::vector<HELEMENT> found;
  auto keep = [](HELEMENT e, void* param) {
    static_cast<std::vector<HELEMENT>*>(param)->push_back(e);
    return false;
  };
  HTMLayoutVisitElements(Root(), nullptr, "id", u"musicselection", keep, &found, 0);
  EXPECT_EQ(found.size(), 3u);
  found.clear();
  HTMLayoutVisitElements(Root(), "p", nullptr, nullptr, keep, &found, 0);
  ASSERT_EQ(found.size(), 2u);
  EXPECT_EQ(Id(found[0]), u"first");
  found.clear();
  HTMLayoutVisitElements(Root(), nullptr, "id", nullptr, keep, &found, 2);  // children and grandchildren only
  EXPECT_EQ(found.size(), 2u);  // #list and #box under body
  found.clear();
  HTMLayoutSelectElements(Root(), "tr:nth-child(2) td:first-child, #second", keep, &found);
  ASSERT_EQ(found.size(), 2u);
  EXPECT_EQ(Text(found[0]), u"2");
  EXPECT_EQ(HTMLayoutSelectElements(Root(), "tr[", keep, &found), DomResult::kInvalidParameter);
  HELEMENT table = nullptr;
  HTMLayoutSelectParent(Find("input"), "table", 0, &table);
  EXPECT_EQ(table, list_);
  HTMLayoutSelectParent(Find("input"), "table", 2, &table);
  EXPECT_EQ(table, nullptr);
}

TEST_F(ApiTest, ProgramStylesAndStatesChangeTheComputedStyle) {
  HELEMENT box = Find("#box");
  HTMLayoutSetStyleAttribute(box, "visibility", u"hidden");
  std::optional<std::u16string> value;
  HTMLayoutGetStyleAttribute(box, "visibility", &value);
  EXPECT_EQ(value, u"hidden");
  bool visible = true;
  HTMLayoutIsElementVisible(Find("#first"), &visible);
  EXPECT_FALSE(visible);
  HTMLayoutSetStyleAttribute(box, "visibility", u"visible");
  HTMLayoutIsElementVisible(Find("#first"), &visible);
  EXPECT_TRUE(visible);
  HTMLayoutSetStyleAttribute(box, "visibility", nullptr);
  HTMLayoutGetStyleAttribute(box, "visibility", &value);
  EXPECT_EQ(value, u"visible");  // computed now: the program's value is gone
  HTMLayoutSetStyleAttribute(box, "width", u"200px");
  HTMLayoutGetStyleAttribute(Find("#first"), "width", &value);
  EXPECT_EQ(value, u"auto");
  HTMLayoutGetStyleAttribute(box, "flow", &value);
  EXPECT_EQ(value, u"default");
  HTMLayoutGetStyleAttribute(box, "color", &value);
  EXPECT_EQ(value, std::nullopt);
  const int before = host_.immediateUpdates();
  const int invalidated = host_.invalidations();
  HTMLayoutSetElementState(box, dom::kStateChecked | dom::kStateCurrent, 0, true);
  EXPECT_GT(host_.invalidations(), invalidated);
  HTMLayoutUpdateElement(box, true);
  EXPECT_EQ(State(box), dom::kStateChecked | dom::kStateCurrent);
  EXPECT_EQ(host_.immediateUpdates(), before + 2);  // both ask for it
  HTMLayoutSetElementState(box, 0, dom::kStateCurrent, false);
  EXPECT_EQ(State(box), dom::kStateChecked);
}

TEST_F(ApiTest, AnswersGeometryFromTheLayoutAndNoneForAnElementNotShown) {
  // Body margin 8; the empty table is its 2px of spacing; #first sits 12px (1em) into #box.
  HELEMENT box = Find("#box");
  Rect location;
  ASSERT_EQ(HTMLayoutGetElementLocation(box, &location, events::kViewRelative | events::kBorderBox), DomResult::kOk);
  EXPECT_EQ(location, (Rect{8, 10, 892, 70}));
  HELEMENT hit = nullptr;
  EXPECT_EQ(HTMLayoutFindElement(window_, {20, 25}, &hit), DomResult::kOk);
  EXPECT_EQ(hit, Find("#first"));
  HTMLayoutMouseInput(window_, {events::kMouseMove, {20, 25}, 0, 0, nullptr});
  EXPECT_TRUE(State(Find("#first")) & dom::kStateHover);

  HTMLayoutSetStyleAttribute(box, "display", u"none");
  EXPECT_EQ(HTMLayoutGetElementLocation(Find("#first"), &location, events::kRootRelative), DomResult::kOperationFailed);
  EXPECT_EQ(HTMLayoutGetScrollInfo(box, nullptr, nullptr, nullptr), DomResult::kOperationFailed);
  EXPECT_EQ(HTMLayoutScrollToView(Find("#second"), 0), DomResult::kOperationFailed);
  EXPECT_EQ(HTMLayoutFindElement(window_, {20, 25}, &hit), DomResult::kOk);
  EXPECT_EQ(Id(hit), u"");  // the body now
}

TEST_F(ApiTest, AWorkerRunsItsCallsOnTheUiThreadInOrderAndWaitsForEach) {
  HELEMENT box = Find("#box");
  std::atomic<bool> done{false};
  std::vector<std::u16string> seenByWorker;
  std::thread worker([&] {
    for (const char16_t* value : {u"one", u"two", u"three"}) {
      HTMLayoutRunOnUiThread(window_, [&] { HTMLayoutSetAttributeByName(box, "step", value); });
      // The call has run when Send returns: read it back, again on the UI thread.
      HTMLayoutRunOnUiThread(window_, [&] {
        std::optional<std::u16string> step;
        HTMLayoutGetAttributeByName(box, "step", &step);
        seenByWorker.push_back(step.value_or(u""));
      });
    }
    done = true;
  });
  while (!done) host_.Pump(*window_, std::chrono::milliseconds(50));
  worker.join();
  EXPECT_EQ(seenByWorker, (std::vector<std::u16string>{u"one", u"two", u"three"}));
}

// Answers every request with the method, the URL and the form, after a short delay.
struct EchoClient final : platform::HttpClient {
  platform::HttpResponse Fetch(const platform::HttpRequest& request) override {
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
    platform::HttpResponse response;
    response.completed = true;
    response.status = request.url.find(u"missing") == std::u16string::npos ? 200 : 404;
    const std::string text = std::string(request.post ? "POST " : "GET ") + EncodeUtf8(platform::UrlWithQuery(request)) +
                             (request.post ? " " + platform::EncodeForm(request.parameters) : "");
    response.body.assign(text.begin(), text.end());
    return response;
  }
};

struct Arrivals {
  std::vector<std::string> bodies;
  std::vector<unsigned> statuses;
  std::vector<std::u16string> uris;
  static bool Proc(void* tag, HELEMENT, unsigned group, void* params) {
    if (group != events::kHandleDataArrived) return false;
    auto& self = *static_cast<Arrivals*>(tag);
    const auto& data = *static_cast<events::DataArrivedParams*>(params);
    self.bodies.emplace_back(reinterpret_cast<const char*>(data.data), data.dataSize);
    self.statuses.push_back(data.status);
    self.uris.emplace_back(data.uri);
    return true;
  }
};

TEST_F(ApiTest, HttpAnswersArriveAsDataEventsOnTheUiThread) {
  window_->SetHttpClient(std::make_shared<EchoClient>());
  HELEMENT box = Find("#box");
  Arrivals arrivals;
  HTMLayoutAttachEventHandlerEx(box, &Arrivals::Proc, &arrivals, events::kHandleDataArrived);
  const RequestParam form[] = {{u"opt", u"5"}, {u"name", u"a b&c"}};
  HTMLayoutHttpRequest(box, u"http://localhost/submit", events::kDataHtml, kPostAsync, form, 2);
  HTMLayoutHttpRequest(box, u"http://localhost/missing", events::kDataHtml, kGetAsync, form, 1);
  for (int i = 0; i < 100 && arrivals.bodies.size() < 2; ++i) host_.Pump(*window_, std::chrono::milliseconds(20));
  ASSERT_EQ(arrivals.bodies.size(), 2u);
  const bool postFirst = arrivals.bodies[0].starts_with("POST");
  const std::size_t post = postFirst ? 0 : 1;
  EXPECT_EQ(arrivals.bodies[post], "POST http://localhost/submit opt=5&name=a+b%26c");
  EXPECT_EQ(arrivals.statuses[post], 0u);
  EXPECT_EQ(arrivals.bodies[1 - post], "GET http://localhost/missing?opt=5");
  EXPECT_EQ(arrivals.statuses[1 - post], 404u);
  HTMLayoutDetachEventHandler(box, &Arrivals::Proc, &arrivals);

  // Requested data for an element that no handler takes becomes its content.
  HTMLayoutRequestElementData(box, u"http://localhost/<b>page</b>", events::kDataHtml, nullptr);
  for (int i = 0; i < 100 && Text(box).find(u"GET") == std::u16string::npos; ++i) {
    host_.Pump(*window_, std::chrono::milliseconds(20));
  }
  EXPECT_EQ(Text(box), u"GET http://localhost/page");
}

}  // namespace
}  // namespace kestrune::html::test
