#include "compoundfile/reader.h"

#include <algorithm>
#include <cstring>
#include <utility>

#include "base/bytes.h"

namespace kestrune::compoundfile {
namespace {

std::uint64_t CeilDiv(std::uint64_t value, std::uint64_t unit) {
  return value / unit + (value % unit != 0 ? 1 : 0);
}

// Follows a chain of sector numbers through `table`. With `links` given, exactly that many
// sectors are taken and the rest of the chain is not looked at; without, the chain runs to its
// end mark. Every sector must be below `limit` and appear once: a chain that leaves the file,
// meets any other mark, or comes back to a sector it has passed is refused.
std::optional<std::vector<std::uint32_t>> FollowChain(const std::vector<std::uint32_t>& table,
                                                      std::uint64_t limit, std::uint32_t start,
                                                      std::optional<std::uint64_t> links) {
  limit = std::min<std::uint64_t>(limit, table.size());
  if (links && *links > limit) return std::nullopt;
  std::vector<std::uint32_t> chain;
  std::vector<bool> passed(static_cast<std::size_t>(limit), false);
  std::uint32_t sector = start;
  while (links ? chain.size() < *links : sector != kEndOfChain) {
    if (sector >= limit || passed[sector]) return std::nullopt;
    passed[sector] = true;
    chain.push_back(sector);
    sector = table[sector];
  }
  return chain;
}

}  // namespace

StreamReader::StreamReader(std::span<const unsigned char> file,
                           std::vector<std::size_t> pieceOffsets, std::size_t pieceSize,
                           std::uint64_t size)
    : file_(file), pieceOffsets_(std::move(pieceOffsets)), pieceSize_(pieceSize), size_(size) {}

std::size_t StreamReader::Read(unsigned char* into, std::size_t count) {
  std::size_t done = 0;
  while (done < count && position_ < size_) {
    const auto piece = static_cast<std::size_t>(position_ / pieceSize_);
    const auto within = static_cast<std::size_t>(position_ % pieceSize_);
    const std::uint64_t take = std::min<std::uint64_t>(
        {pieceSize_ - within, size_ - position_, static_cast<std::uint64_t>(count - done)});
    std::memcpy(into + done, file_.data() + pieceOffsets_[piece] + within,
                static_cast<std::size_t>(take));
    done += static_cast<std::size_t>(take);
    position_ += take;
  }
  return done;
}

std::optional<CompoundFileReader> CompoundFileReader::Open(std::span<const unsigned char> file) {
  CompoundFileReader reader(file);
  if (!reader.ReadHeader() || !reader.ReadFat() || !reader.ReadDirectory() ||
      !reader.ReadMiniStream()) {
    return std::nullopt;
  }
  return reader;
}

bool CompoundFileReader::ReadHeader() {
  if (file_.size() < kHeaderSize) return false;
  const unsigned char* head = file_.data();
  if (!std::equal(kSignature.begin(), kSignature.end(), head)) return false;
  if (LoadU16Le(head + header::kByteOrder) != 0xFFFE) return false;
  // Version 3: 512-byte sectors. ole32 writes version 4 (4096-byte sectors) only when asked.
  if (LoadU16Le(head + header::kMajorVersion) != 3) return false;
  if (LoadU16Le(head + header::kSectorShift) != 9) return false;
  if (LoadU16Le(head + header::kMiniSectorShift) != 6) return false;
  if (LoadU32Le(head + header::kMiniStreamCutoff) != kMiniStreamCutoff) return false;
  // A partial sector at the end is never used.
  sectorCount_ = static_cast<std::uint32_t>(std::min<std::uint64_t>(
      (file_.size() - kSectorSize) / kSectorSize, kMaxRegularSector + std::uint64_t{1}));
  return true;
}

bool CompoundFileReader::ReadFat() {
  const unsigned char* head = file_.data();
  const std::uint32_t fatSectorCount = LoadU32Le(head + header::kFatSectorCount);
  if (fatSectorCount > sectorCount_) return false;

  std::vector<std::uint32_t> fatSectors;
  fatSectors.reserve(fatSectorCount);
  for (std::size_t i = 0; i < kHeaderDifatCount && fatSectors.size() < fatSectorCount; ++i) {
    fatSectors.push_back(LoadU32Le(head + header::kDifat + 4 * i));
  }
  // The rest of the list is in a chain of DIFAT sectors, each ending with the next one's number.
  const std::size_t perDifatSector = kSectorSize / 4 - 1;
  std::vector<bool> passed(sectorCount_, false);
  std::uint32_t difat = LoadU32Le(head + header::kFirstDifatSector);
  while (fatSectors.size() < fatSectorCount) {
    if (difat >= sectorCount_ || passed[difat]) return false;
    passed[difat] = true;
    const unsigned char* at = file_.data() + SectorOffset(difat);
    for (std::size_t i = 0; i < perDifatSector && fatSectors.size() < fatSectorCount; ++i) {
      fatSectors.push_back(LoadU32Le(at + 4 * i));
    }
    difat = LoadU32Le(at + 4 * perDifatSector);
  }

  const std::size_t perSector = kSectorSize / 4;
  fat_.reserve(fatSectors.size() * perSector);
  for (const std::uint32_t sector : fatSectors) {
    if (sector >= sectorCount_) return false;
    const unsigned char* at = file_.data() + SectorOffset(sector);
    for (std::size_t i = 0; i < perSector; ++i) fat_.push_back(LoadU32Le(at + 4 * i));
  }
  return true;
}

std::optional<std::vector<std::uint32_t>> CompoundFileReader::RegularChain(
    std::uint32_t start, std::optional<std::uint64_t> links) const {
  return FollowChain(fat_, sectorCount_, start, links);
}

bool CompoundFileReader::ReadDirectory() {
  const auto sectors = RegularChain(LoadU32Le(file_.data() + header::kFirstDirectorySector), {});
  if (!sectors || sectors->empty()) return false;
  const std::size_t perSector = kSectorSize / kDirectoryEntrySize;
  const std::size_t entryCount = sectors->size() * perSector;
  const auto entryAt = [&](std::size_t id) {
    return file_.data() + SectorOffset((*sectors)[id / perSector]) +
           (id % perSector) * kDirectoryEntrySize;
  };

  const unsigned char* root = entryAt(0);
  if (root[entry::kType] != static_cast<unsigned char>(EntryType::kRoot)) return false;
  // Sizes are 32-bit in version 3 files; old writers left garbage in the field's high half.
  miniStreamSize_ = LoadU32Le(root + entry::kSize);
  miniStreamStart_ = LoadU32Le(root + entry::kStartSector);

  // Walk the root's sibling tree; an entry met twice means the tree has a cycle.
  std::vector<bool> met(entryCount, false);
  met[0] = true;
  std::vector<std::pair<std::uint32_t, Entry>> found;
  std::vector<std::uint32_t> pending{LoadU32Le(root + entry::kChild)};
  while (!pending.empty()) {
    const std::uint32_t id = pending.back();
    pending.pop_back();
    if (id == kNoEntry) continue;
    if (id >= entryCount || met[id]) return false;
    met[id] = true;
    const unsigned char* at = entryAt(id);
    const auto type = static_cast<EntryType>(at[entry::kType]);
    if (type != EntryType::kStream && type != EntryType::kStorage) return false;
    const std::uint16_t nameBytes = LoadU16Le(at + entry::kNameLength);
    if (nameBytes < 2 || nameBytes > 2 * (kMaxNameUnits + 1) || nameBytes % 2 != 0) return false;
    if (type == EntryType::kStream) {
      Entry stream;
      for (std::size_t i = 0; i + 1 < nameBytes / 2u; ++i) {
        const char16_t unit = LoadU16Le(at + entry::kName + 2 * i);
        if (unit == 0) break;
        stream.name += unit;
      }
      stream.startSector = LoadU32Le(at + entry::kStartSector);
      stream.size = LoadU32Le(at + entry::kSize);
      found.emplace_back(id, std::move(stream));
    }
    pending.push_back(LoadU32Le(at + entry::kLeftSibling));
    pending.push_back(LoadU32Le(at + entry::kRightSibling));
  }
  std::sort(found.begin(), found.end(),
            [](const auto& a, const auto& b) { return a.first < b.first; });
  for (auto& [id, stream] : found) streams_.push_back(std::move(stream));
  return true;
}

bool CompoundFileReader::ReadMiniStream() {
  const auto miniStream = RegularChain(miniStreamStart_, CeilDiv(miniStreamSize_, kSectorSize));
  const auto sectors = RegularChain(LoadU32Le(file_.data() + header::kFirstMiniFatSector), {});
  if (!miniStream || !sectors) return false;
  miniStreamSectors_ = *miniStream;
  const std::size_t perSector = kSectorSize / 4;
  miniFat_.reserve(sectors->size() * perSector);
  for (const std::uint32_t sector : *sectors) {
    const unsigned char* at = file_.data() + SectorOffset(sector);
    for (std::size_t i = 0; i < perSector; ++i) miniFat_.push_back(LoadU32Le(at + 4 * i));
  }
  return true;
}

std::vector<std::u16string> CompoundFileReader::StreamNames() const {
  std::vector<std::u16string> names;
  for (const Entry& stream : streams_) names.push_back(stream.name);
  return names;
}

std::optional<StreamReader> CompoundFileReader::OpenStream(std::u16string_view name) const {
  const auto stream = std::find_if(streams_.begin(), streams_.end(), [&](const Entry& entry) {
    return CompareEntryNames(entry.name, name) == 0;
  });
  if (stream == streams_.end()) return std::nullopt;

  std::vector<std::size_t> offsets;
  if (stream->size < kMiniStreamCutoff) {
    const auto chain = FollowChain(miniFat_, CeilDiv(miniStreamSize_, kMiniSectorSize),
                                   stream->startSector, CeilDiv(stream->size, kMiniSectorSize));
    if (!chain) return std::nullopt;
    for (const std::uint32_t mini : *chain) {
      const std::size_t inMiniStream = mini * kMiniSectorSize;
      offsets.push_back(SectorOffset(miniStreamSectors_[inMiniStream / kSectorSize]) +
                        inMiniStream % kSectorSize);
    }
    return StreamReader(file_, std::move(offsets), kMiniSectorSize, stream->size);
  }
  const auto chain = RegularChain(stream->startSector, CeilDiv(stream->size, kSectorSize));
  if (!chain) return std::nullopt;
  for (const std::uint32_t sector : *chain) offsets.push_back(SectorOffset(sector));
  return StreamReader(file_, std::move(offsets), kSectorSize, stream->size);
}

}  // namespace kestrune::compoundfile
