#include "itunesdb/parse_chunk.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <string>
#include <vector>

namespace kestrune::itunesdb {
namespace {

[[noreturn]] void Refuse(const std::string& what, std::int64_t offset) {
  throw MalformedDatabase(what + " at offset " + std::to_string(offset));
}

class TreeBuilder {
 public:
  TreeBuilder(DbChunkReader& reader, RecordArena& arena) : reader_(reader), arena_(arena) {}

  DbChunk ReadAndParse(ChunkContext context, int depth) {
    const std::int32_t offset = reader_.Tell();
    std::optional<RecordBytes> record = reader_.ReadChunk();
    if (!record) Refuse("truncated or impossible record", offset);
    return Parse(*record, context, depth, offset);
  }

  DbChunk Parse(RecordBytes record, ChunkContext context, int depth, std::int64_t offset) {
    if (depth > kMaximumNesting) Refuse("records nested too deeply", offset);
    DbChunk node{record, {}};
    const std::uint32_t tag = node.Tag();
    const RecordShape shape = ShapeOf(tag);
    // Most records are string records without children: nothing more to do for them.
    if (shape.kind == RecordKind::kUnknown ||
        (shape.kind == RecordKind::kString && !IsPhotoNameRecord(node, context))) {
      return node;
    }
    ChunkContext childContext = context;
    if (tag == kTagMhbd) childContext = ChunkContext::kMusic;
    if (tag == kTagMhfd) childContext = ChunkContext::kPhoto;

    // Children are gathered in a list kept per depth, then copied into the arena at their exact
    // count: no list grows in the arena, and the lists are reused from record to record.
    std::vector<DbChunk>& children = pending_[static_cast<std::size_t>(depth)];
    children.clear();
    switch (shape.kind) {
      case RecordKind::kList:
        for (std::uint32_t i = 0, count = node.U32At(shape.countOffset); i < count; ++i) {
          children.push_back(ReadAndParse(childContext, depth + 1));
        }
        break;
      case RecordKind::kLength:
        ParseByLength(node, childContext, depth, offset, children);
        break;
      case RecordKind::kString: {
        // The child begins where the body begins: step back over the body ReadChunk took.
        const auto body = static_cast<std::int32_t>(node.rawRecord.size() - node.HeaderLength());
        reader_.Seek(-body, SeekOrigin::kCurrent);
        children.push_back(ReadAndParse(context, depth + 1));
        break;
      }
      case RecordKind::kUnknown:
        // Only the header belongs to it; whatever follows is read as the next record.
        break;
    }
    if (!children.empty()) {
      DbChunk* kept = arena_.AllocateArray<DbChunk>(children.size());
      std::uninitialized_copy(children.begin(), children.end(), kept);
      node.children = std::span<DbChunk>(kept, children.size());
    }
    return node;
  }

 private:
  static bool IsPhotoNameRecord(const DbChunk& node, ChunkContext context) {
    if (context != ChunkContext::kPhoto) return false;
    const std::uint16_t type = node.U16At(kMhodTypeOffset);
    return type == 2 || type == 5;
  }

  void ParseByLength(const DbChunk& node, ChunkContext context, int depth, std::int64_t offset,
                     std::vector<DbChunk>& children) {
    const std::uint32_t total = node.U32At(kSizeWordOffset);
    const std::uint32_t header = node.HeaderLength();
    if (total < header) Refuse("total length below header length", offset);
    std::int64_t remaining = std::int64_t{total} - header;
    while (remaining > 0) {
      const std::int32_t before = reader_.Tell();
      children.push_back(ReadAndParse(context, depth + 1));
      remaining -= std::int64_t{reader_.Tell()} - before;
    }
  }

  DbChunkReader& reader_;
  RecordArena& arena_;
  std::array<std::vector<DbChunk>, kMaximumNesting + 1> pending_;
};

}  // namespace

DbChunk ParseChunk(RecordBytes record, DbChunkReader& reader, ChunkContext context,
                   RecordArena& arena) {
  TreeBuilder builder(reader, arena);
  const std::int64_t offset =
      std::int64_t{reader.Tell()} - static_cast<std::int64_t>(record.size());
  return builder.Parse(record, context, 0, offset);
}

DbChunk ParseDatabase(DbChunkReader& reader, RecordArena& arena) {
  TreeBuilder builder(reader, arena);
  return builder.ReadAndParse(ChunkContext::kNone, 0);
}

}  // namespace kestrune::itunesdb
