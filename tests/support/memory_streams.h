#pragma once
// In-memory scene-file streams for tests: MemorySave records nested chunks into a ChunkTree,
// MemoryLoad reads one back with the host's loading rules (one level at a time, short reads are
// errors).

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "vynutil/scene_streams.h"

namespace vyn::test {

// A chunk: its identifier and either bytes or nested chunks.
struct Chunk {
  USHORT id = 0;
  std::vector<std::uint8_t> bytes;
  std::vector<Chunk> children;
};

class MemorySave : public ISave {
 public:
  void BeginChunk(USHORT id) override;
  void EndChunk() override;
  IOResult Write(const void* buffer, ULONG bytes, ULONG* written) override;
  IOResult WriteWString(const MCHAR* text) override;
  INT_PTR Execute(int code, ULONG_PTR arg1, ULONG_PTR arg2, ULONG_PTR arg3) override;

  // The top-level chunks written so far.
  const std::vector<Chunk>& Chunks() const { return root_.children; }
  // Whether every begun chunk was ended.
  bool Balanced() const { return open_.empty() && !misuse_; }

  std::vector<int> requests;  // codes passed to Execute
  INT_PTR request_answer = 0;
  bool fail_writes = false;   // true: Write and WriteWString answer IO_ERROR

 private:
  Chunk* Current();
  Chunk root_;
  std::vector<std::size_t> open_;  // the path of child indices to the innermost open chunk
  bool misuse_ = false;
};

class MemoryLoad : public ILoad {
 public:
  explicit MemoryLoad(std::vector<Chunk> chunks);
  IOResult OpenChunk() override;
  USHORT CurChunkID() override;
  IOResult Read(void* buffer, ULONG bytes, ULONG* read) override;
  IOResult ReadWStringChunk(MCHAR** text) override;
  IOResult CloseChunk() override;

 private:
  struct Level {
    const std::vector<Chunk>* chunks;
    std::size_t next = 0;          // the next chunk to open at this level
    const Chunk* open = nullptr;   // the chunk opened at this level
    std::size_t position = 0;      // read position inside the open chunk
  };
  std::vector<Chunk> chunks_;
  std::vector<Level> levels_;
  std::vector<std::unique_ptr<std::u16string>> strings_;  // owned results of ReadWStringChunk
};

}  // namespace vyn::test
