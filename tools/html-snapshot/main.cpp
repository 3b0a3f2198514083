// html-snapshot PAGE.html OUT.png [WIDTH HEIGHT]: lays a page out and paints it with cairo and
// Pango into a PNG of exactly that size (900 x 623 unless given), so that a page can be looked
// at without a window. Style sheets and images load relative to the page's folder.
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "base/utf.h"
#include "html/api/htmlayout.h"
#include "html/canvas_cairo/cairo_canvas.h"
#include "html/host/headless_host.h"

namespace {

using namespace kestrune::html;

int Usage() {
  std::fprintf(stderr, "usage: html-snapshot PAGE.html OUT.png [WIDTH HEIGHT]\n");
  return 2;
}

bool ParseSide(const char* text, int* side) {
  try {
    std::size_t used = 0;
    const int value = std::stoi(text, &used);
    if (used != std::char_traits<char>::length(text) || value < 1 || value > 16384) return false;
    *side = value;
    return true;
  } catch (const std::exception&) {
    return false;
  }
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 3 && argc != 5) return Usage();
  Size size{900, 623};
  if (argc == 5 && (!ParseSide(argv[3], &size.width) || !ParseSide(argv[4], &size.height))) return Usage();
  std::error_code error;
  const std::filesystem::path page = std::filesystem::absolute(argv[1], error);
  std::ifstream file(page, std::ios::binary);
  if (error || !std::filesystem::is_regular_file(page, error) || !file) {
    std::fprintf(stderr, "html-snapshot: cannot read %s\n", argv[1]);
    return 1;
  }
  const std::vector<unsigned char> html((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());

  canvas_cairo::PangoText text;
  host::HeadlessHost host(text, size);
  HLWINDOW window = HTMLayoutCreateWindow(host);
  // The page's own path is its URL: what it refers to is found beside it.
  const std::u16string url = kestrune::DecodeUtf8(page.generic_string());
  HTMLayoutLoadHtmlEx(window, html.data(), html.size(), url.c_str());
  HTMLayoutRunPending(window);  // behaviors attached and posted events run, as in a window
  canvas_cairo::CairoCanvas canvas(size, text);
  HTMLayoutPaint(window, canvas, {0, 0, size.width, size.height});
  HTMLayoutDestroyWindow(window);
  if (!canvas.WritePng(argv[2])) {
    std::fprintf(stderr, "html-snapshot: cannot write %s\n", argv[2]);
    return 1;
  }
  return 0;
}
