#include "itunesdb/parse_chunk.h"

#include <string>

namespace kestrune::itunesdb {
namespace {

[[noreturn]] void Refuse(const std::string& what, std::int64_t offset) {
  throw MalformedDatabase(what + " at offset " + std::to_string(offset));
}

class TreeBuilder {
 public:
  explicit TreeBuilder(DbChunkReader& reader) : reader_(reader) {}

  DbChunk ReadAndParse(ChunkContext context, int depth) {
    const std::int32_t offset = reader_.Tell();
    std::optional<RecordBytes> record = reader_.ReadChunk();
    if (!record) Refuse("truncated or impossible record", offset);
    return Parse(std::move(*record), context, depth, offset);
  }

  DbChunk Parse(RecordBytes record, ChunkContext context, int depth, std::int64_t offset) {
    if (depth > kMaximumNesting) Refuse("records nested too deeply", offset);
    DbChunk node{std::move(record), {}};
    const std::uint32_t tag = node.Tag();
    const RecordShape shape = ShapeOf(tag);
    ChunkContext childContext = context;
    if (tag == kTagMhbd) childContext = ChunkContext::kMusic;
    if (tag == kTagMhfd) childContext = ChunkContext::kPhoto;

    switch (shape.kind) {
      case RecordKind::kList:
        ParseList(node, node.U32At(shape.countOffset), childContext, depth);
        break;
      case RecordKind::kLength:
        ParseByLength(node, childContext, depth, offset);
        break;
      case RecordKind::kString:
        ParsePhotoStringChild(node, context, depth);
        break;
      case RecordKind::kUnknown:
        // Only the header belongs to it; whatever follows is read as the next record.
        break;
    }
    return node;
  }

 private:
  void ParseList(DbChunk& node, std::uint32_t count, ChunkContext context, int depth) {
    for (std::uint32_t i = 0; i < count; ++i) {
      node.children.push_back(ReadAndParse(context, depth + 1));
    }
  }

  void ParseByLength(DbChunk& node, ChunkContext context, int depth, std::int64_t offset) {
    const std::uint32_t total = node.U32At(kSizeWordOffset);
    const std::uint32_t header = node.HeaderLength();
    if (total < header) Refuse("total length below header length", offset);
    std::int64_t remaining = std::int64_t{total} - header;
    while (remaining > 0) {
      const std::int32_t before = reader_.Tell();
      node.children.push_back(ReadAndParse(context, depth + 1));
      remaining -= std::int64_t{reader_.Tell()} - before;
    }
  }

  void ParsePhotoStringChild(DbChunk& node, ChunkContext context, int depth) {
    if (context != ChunkContext::kPhoto) return;
    const std::uint16_t type = node.U16At(kMhodTypeOffset);
    if (type != 2 && type != 5) return;
    // The child begins where the body begins: step back over the body that ReadChunk took.
    const auto body = static_cast<std::int32_t>(node.rawRecord.size() - node.HeaderLength());
    reader_.Seek(-body, SeekOrigin::kCurrent);
    node.children.push_back(ReadAndParse(context, depth + 1));
  }

  DbChunkReader& reader_;
};

}  // namespace

DbChunk ParseChunk(RecordBytes record, DbChunkReader& reader, ChunkContext context) {
  TreeBuilder builder(reader);
  const std::int64_t offset = std::int64_t{reader.Tell()} - static_cast<std::int64_t>(record.size());
  return builder.Parse(std::move(record), context, 0, offset);
}

DbChunk ParseDatabase(DbChunkReader& reader) {
  TreeBuilder builder(reader);
  return builder.ReadAndParse(ChunkContext::kNone, 0);
}

}  // namespace kestrune::itunesdb
