#pragma once

#include "itunesdb/chunk_reader.h"
#include "itunesdb/db_chunk.h"
#include "itunesdb/record_arena.h"

namespace kestrune::itunesdb {

// Builds the node for an already read record and, reading them from `reader`, the nodes of all
// its descendants; child lists are made in `arena`, which must outlive the tree. Throws
// MalformedDatabase when the records do not fit together.
DbChunk ParseChunk(RecordBytes record, DbChunkReader& reader, ChunkContext context,
                   RecordArena& arena);

// Reads the first record from `reader` and parses the whole tree below it. Throws
// MalformedDatabase when the source ends inside that record.
DbChunk ParseDatabase(DbChunkReader& reader, RecordArena& arena);

}  // namespace kestrune::itunesdb
