#include "compoundfile/writer.h"

#include <algorithm>
#include <cstring>
#include <numeric>
#include <stdexcept>

#include "base/bytes.h"
#include "compoundfile/format.h"

namespace kestrune::compoundfile {
namespace {

constexpr std::size_t kLinksPerSector = kSectorSize / 4;
constexpr std::size_t kDifatLinksPerSector = kLinksPerSector - 1;
constexpr std::size_t kEntriesPerSector = kSectorSize / kDirectoryEntrySize;
constexpr std::uint64_t kMaxStreamSize = 0x7FFFFFFF;

std::size_t CeilDiv(std::size_t value, std::size_t unit) { return (value + unit - 1) / unit; }

void CheckNames(std::span<const NamedStream> streams) {
  for (const NamedStream& stream : streams) {
    const std::u16string& name = stream.name;
    if (name.empty() || name.size() > kMaxNameUnits) {
      throw std::invalid_argument("a stream name must have 1 to 31 characters");
    }
    for (const char16_t unit : name) {
      if (unit < 0x20 || unit > 0x7E || unit == u'/' || unit == u'\\' || unit == u':' ||
          unit == u'!') {
        throw std::invalid_argument("a stream name holds a character a compound file refuses");
      }
    }
    if (stream.bytes.size() > kMaxStreamSize) {
      throw std::length_error("a stream of 2 GB or more does not fit a version 3 compound file");
    }
  }
}

struct TreeLinks {
  std::uint32_t left = kNoEntry;
  std::uint32_t right = kNoEntry;
  EntryColor color = EntryColor::kBlack;
};

// Each range's middle entry becomes its root, so the paths to the tree's empty leaves differ in
// length by one at most. Colouring the deepest level red when it is not full gives every path
// the same number of black entries: a valid red-black tree, which readers may expect.
std::uint32_t LinkTree(std::vector<TreeLinks>& links, std::size_t begin, std::size_t end, int depth,
                       int redDepth) {
  if (begin == end) return kNoEntry;
  const std::size_t middle = begin + (end - begin) / 2;
  links[middle].left = LinkTree(links, begin, middle, depth + 1, redDepth);
  links[middle].right = LinkTree(links, middle + 1, end, depth + 1, redDepth);
  links[middle].color = depth == redDepth ? EntryColor::kRed : EntryColor::kBlack;
  return static_cast<std::uint32_t>(middle + 1);  // entry 0 is the root storage
}

// Where each part of the file goes, in sectors after the header.
struct Layout {
  std::size_t fatSectors = 0;
  std::size_t difatSectors = 0;
  std::size_t directorySectors = 0;
  std::size_t miniFatSectors = 0;
  std::size_t miniStreamSectors = 0;
  std::size_t streamSectors = 0;

  std::size_t FirstDifat() const { return fatSectors; }
  std::size_t FirstDirectory() const { return FirstDifat() + difatSectors; }
  std::size_t FirstMiniFat() const { return FirstDirectory() + directorySectors; }
  std::size_t FirstMiniStream() const { return FirstMiniFat() + miniFatSectors; }
  std::size_t FirstStream() const { return FirstMiniStream() + miniStreamSectors; }
  std::size_t Total() const { return FirstStream() + streamSectors; }
};

Layout PlanLayout(std::size_t streamCount, std::size_t miniSectors, std::size_t streamSectors) {
  Layout layout;
  layout.directorySectors = CeilDiv(streamCount + 1, kEntriesPerSector);
  layout.miniFatSectors = CeilDiv(miniSectors, kLinksPerSector);
  layout.miniStreamSectors = CeilDiv(miniSectors * kMiniSectorSize, kSectorSize);
  layout.streamSectors = streamSectors;
  // The FAT covers itself and the DIFAT sectors that list it: grow both until they settle.
  for (;;) {
    const std::size_t fat = CeilDiv(layout.Total(), kLinksPerSector);
    const std::size_t difat =
        fat > kHeaderDifatCount ? CeilDiv(fat - kHeaderDifatCount, kDifatLinksPerSector) : 0;
    if (fat == layout.fatSectors && difat == layout.difatSectors) break;
    layout.fatSectors = fat;
    layout.difatSectors = difat;
  }
  if (layout.Total() > kMaxRegularSector) {
    throw std::length_error("the streams do not fit one compound file");
  }
  return layout;
}

// Links `count` consecutive units from `first` into one chain of `table`.
std::uint32_t LinkRun(std::vector<std::uint32_t>& table, std::size_t first, std::size_t count) {
  if (count == 0) return kEndOfChain;
  for (std::size_t i = first; i + 1 < first + count; ++i) {
    table[i] = static_cast<std::uint32_t>(i + 1);
  }
  table[first + count - 1] = kEndOfChain;
  return static_cast<std::uint32_t>(first);
}

void WriteEntry(unsigned char* at, std::u16string_view name, EntryType type, const TreeLinks& links,
                std::uint32_t child, std::uint32_t start, std::uint64_t size) {
  for (std::size_t i = 0; i < name.size(); ++i) StoreU16Le(at + entry::kName + 2 * i, name[i]);
  StoreU16Le(at + entry::kNameLength, static_cast<std::uint16_t>(2 * (name.size() + 1)));
  at[entry::kType] = static_cast<unsigned char>(type);
  at[entry::kColor] = static_cast<unsigned char>(links.color);
  StoreU32Le(at + entry::kLeftSibling, links.left);
  StoreU32Le(at + entry::kRightSibling, links.right);
  StoreU32Le(at + entry::kChild, child);
  StoreU32Le(at + entry::kStartSector, start);
  StoreU32Le(at + entry::kSize, static_cast<std::uint32_t>(size));
}

void WriteHeader(unsigned char* at, const Layout& layout, std::size_t miniSectors) {
  std::copy(kSignature.begin(), kSignature.end(), at);
  StoreU16Le(at + header::kMinorVersion, 0x003E);
  StoreU16Le(at + header::kMajorVersion, 3);
  StoreU16Le(at + header::kByteOrder, 0xFFFE);
  StoreU16Le(at + header::kSectorShift, 9);
  StoreU16Le(at + header::kMiniSectorShift, 6);
  StoreU32Le(at + header::kFatSectorCount, static_cast<std::uint32_t>(layout.fatSectors));
  StoreU32Le(at + header::kFirstDirectorySector,
             static_cast<std::uint32_t>(layout.FirstDirectory()));
  StoreU32Le(at + header::kMiniStreamCutoff, static_cast<std::uint32_t>(kMiniStreamCutoff));
  StoreU32Le(at + header::kFirstMiniFatSector,
             miniSectors > 0 ? static_cast<std::uint32_t>(layout.FirstMiniFat()) : kEndOfChain);
  StoreU32Le(at + header::kMiniFatSectorCount, static_cast<std::uint32_t>(layout.miniFatSectors));
  StoreU32Le(at + header::kFirstDifatSector, layout.difatSectors > 0
                                                 ? static_cast<std::uint32_t>(layout.FirstDifat())
                                                 : kEndOfChain);
  StoreU32Le(at + header::kDifatSectorCount, static_cast<std::uint32_t>(layout.difatSectors));
  for (std::size_t i = 0; i < kHeaderDifatCount; ++i) {
    StoreU32Le(at + header::kDifat + 4 * i,
               i < layout.fatSectors ? static_cast<std::uint32_t>(i) : kFreeSector);
  }
}

}  // namespace

std::vector<unsigned char> WriteCompoundFile(std::span<const NamedStream> streams) {
  CheckNames(streams);
  std::vector<std::size_t> order(streams.size());
  std::iota(order.begin(), order.end(), std::size_t{0});
  std::sort(order.begin(), order.end(), [&](std::size_t a, std::size_t b) {
    return CompareEntryNames(streams[a].name, streams[b].name) < 0;
  });
  for (std::size_t i = 1; i < order.size(); ++i) {
    if (CompareEntryNames(streams[order[i - 1]].name, streams[order[i]].name) == 0) {
      throw std::invalid_argument("two streams have the same name");
    }
  }

  std::size_t miniSectors = 0;
  std::size_t streamSectors = 0;
  for (const NamedStream& stream : streams) {
    if (stream.bytes.size() < kMiniStreamCutoff) {
      miniSectors += CeilDiv(stream.bytes.size(), kMiniSectorSize);
    } else {
      streamSectors += CeilDiv(stream.bytes.size(), kSectorSize);
    }
  }
  const Layout layout = PlanLayout(streams.size(), miniSectors, streamSectors);

  std::vector<unsigned char> file((layout.Total() + 1) * kSectorSize, 0);
  const auto sector = [&](std::size_t index) { return file.data() + (index + 1) * kSectorSize; };
  std::vector<std::uint32_t> fat(layout.fatSectors * kLinksPerSector, kFreeSector);
  std::vector<std::uint32_t> miniFat(layout.miniFatSectors * kLinksPerSector, kFreeSector);
  std::fill_n(fat.begin(), layout.fatSectors, kFatSector);
  std::fill_n(fat.begin() + static_cast<std::ptrdiff_t>(layout.FirstDifat()), layout.difatSectors,
              kDifatSector);
  LinkRun(fat, layout.FirstDirectory(), layout.directorySectors);
  LinkRun(fat, layout.FirstMiniFat(), layout.miniFatSectors);
  const std::uint32_t miniStreamStart =
      LinkRun(fat, layout.FirstMiniStream(), layout.miniStreamSectors);

  std::vector<TreeLinks> tree(streams.size());
  int redDepth = -1;
  const std::size_t n = streams.size();
  if (n > 0 && ((n + 1) & n) != 0) {  // the last level is partial: colour it red
    redDepth = 0;
    while ((std::size_t{2} << redDepth) <= n) ++redDepth;
  }
  const std::uint32_t treeRoot = LinkTree(tree, 0, n, 0, redDepth);

  std::size_t nextMini = 0;
  std::size_t nextSector = layout.FirstStream();
  for (std::size_t i = 0; i < n; ++i) {
    const NamedStream& stream = streams[order[i]];
    const std::size_t size = stream.bytes.size();
    std::uint32_t start = kEndOfChain;
    if (size < kMiniStreamCutoff) {
      const std::size_t count = CeilDiv(size, kMiniSectorSize);
      start = LinkRun(miniFat, nextMini, count);
      if (size > 0) {
        std::memcpy(sector(layout.FirstMiniStream()) + nextMini * kMiniSectorSize,
                    stream.bytes.data(), size);
      }
      nextMini += count;
    } else {
      const std::size_t count = CeilDiv(size, kSectorSize);
      start = LinkRun(fat, nextSector, count);
      std::memcpy(sector(nextSector), stream.bytes.data(), size);
      nextSector += count;
    }
    WriteEntry(sector(layout.FirstDirectory()) + (i + 1) * kDirectoryEntrySize, stream.name,
               EntryType::kStream, tree[i], kNoEntry, start, size);
  }

  unsigned char* directory = sector(layout.FirstDirectory());
  WriteEntry(directory, u"Root Entry", EntryType::kRoot, TreeLinks{}, treeRoot,
             miniSectors > 0 ? miniStreamStart : kEndOfChain, miniSectors * kMiniSectorSize);
  for (std::size_t unused = n + 1; unused < layout.directorySectors * kEntriesPerSector; ++unused) {
    unsigned char* at = directory + unused * kDirectoryEntrySize;
    StoreU32Le(at + entry::kLeftSibling, kNoEntry);
    StoreU32Le(at + entry::kRightSibling, kNoEntry);
    StoreU32Le(at + entry::kChild, kNoEntry);
  }

  WriteHeader(file.data(), layout, miniSectors);
  for (std::size_t d = 0; d < layout.difatSectors; ++d) {
    unsigned char* at = sector(layout.FirstDifat() + d);
    for (std::size_t i = 0; i < kDifatLinksPerSector; ++i) {
      const std::size_t listed = kHeaderDifatCount + d * kDifatLinksPerSector + i;
      StoreU32Le(at + 4 * i,
                 listed < layout.fatSectors ? static_cast<std::uint32_t>(listed) : kFreeSector);
    }
    const bool last = d + 1 == layout.difatSectors;
    StoreU32Le(at + 4 * kDifatLinksPerSector,
               last ? kEndOfChain : static_cast<std::uint32_t>(layout.FirstDifat() + d + 1));
  }
  for (std::size_t i = 0; i < fat.size(); ++i) StoreU32Le(sector(0) + 4 * i, fat[i]);
  for (std::size_t i = 0; i < miniFat.size(); ++i) {
    StoreU32Le(sector(layout.FirstMiniFat()) + 4 * i, miniFat[i]);
  }
  return file;
}

}  // namespace kestrune::compoundfile
