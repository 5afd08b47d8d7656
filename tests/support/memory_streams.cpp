#include "support/memory_streams.h"

#include <cstring>

namespace vyn::test {

Chunk* MemorySave::Current() {
  Chunk* chunk = &root_;
  for (std::size_t index : open_) chunk = &chunk->children[index];
  return chunk;
}

void MemorySave::BeginChunk(USHORT id) {
  Chunk* parent = Current();
  parent->children.push_back(Chunk{id, {}, {}});
  open_.push_back(parent->children.size() - 1);
}

void MemorySave::EndChunk() {
  if (open_.empty()) {
    misuse_ = true;
    return;
  }
  open_.pop_back();
}

IOResult MemorySave::Write(const void* buffer, ULONG bytes, ULONG* written) {
  if (written) *written = 0;
  if (fail_writes || open_.empty()) return IO_ERROR;
  const auto* first = static_cast<const std::uint8_t*>(buffer);
  Chunk* chunk = Current();
  chunk->bytes.insert(chunk->bytes.end(), first, first + bytes);
  if (written) *written = bytes;
  return IO_OK;
}

IOResult MemorySave::WriteWString(const MCHAR* text) {
  const std::size_t units = std::char_traits<MCHAR>::length(text) + 1;
  ULONG written = 0;
  return Write(text, static_cast<ULONG>(units * sizeof(MCHAR)), &written);
}

INT_PTR MemorySave::Execute(int code, ULONG_PTR, ULONG_PTR, ULONG_PTR) {
  requests.push_back(code);
  return request_answer;
}

MemoryLoad::MemoryLoad(std::vector<Chunk> chunks) : chunks_(std::move(chunks)) {
  levels_.push_back(Level{&chunks_});
}

IOResult MemoryLoad::OpenChunk() {
  Level& level = levels_.back();
  if (level.open) {
    // Opening inside an open chunk descends into its children.
    levels_.push_back(Level{&level.open->children});
    return OpenChunk();
  }
  if (level.next >= level.chunks->size()) return IO_END;
  level.open = &(*level.chunks)[level.next++];
  level.position = 0;
  return IO_OK;
}

USHORT MemoryLoad::CurChunkID() {
  const Level& level = levels_.back();
  return level.open ? level.open->id : 0;
}

IOResult MemoryLoad::Read(void* buffer, ULONG bytes, ULONG* read) {
  if (read) *read = 0;
  Level& level = levels_.back();
  if (!level.open) return IO_ERROR;
  const std::size_t available = level.open->bytes.size() - level.position;
  const std::size_t n = bytes < available ? bytes : available;
  if (n) std::memcpy(buffer, level.open->bytes.data() + level.position, n);
  level.position += n;
  if (read) *read = static_cast<ULONG>(n);
  return n == bytes ? IO_OK : IO_ERROR;
}

IOResult MemoryLoad::ReadWStringChunk(MCHAR** text) {
  Level& level = levels_.back();
  if (!level.open || !text) return IO_ERROR;
  auto value = std::make_unique<std::u16string>();
  const std::vector<std::uint8_t>& bytes = level.open->bytes;
  for (;;) {
    if (level.position + sizeof(MCHAR) > bytes.size()) return IO_ERROR;  // no terminator
    MCHAR unit;
    std::memcpy(&unit, bytes.data() + level.position, sizeof unit);
    level.position += sizeof unit;
    if (unit == 0) break;
    value->push_back(unit);
  }
  *text = value->data();
  strings_.push_back(std::move(value));
  return IO_OK;
}

IOResult MemoryLoad::CloseChunk() {
  Level& level = levels_.back();
  if (level.open) {
    level.open = nullptr;
    return IO_OK;
  }
  // Closing with nothing open at this level closes the parent chunk.
  if (levels_.size() == 1) return IO_ERROR;
  levels_.pop_back();
  levels_.back().open = nullptr;
  return IO_OK;
}

}  // namespace vyn::test
