// DIBs read from .bmp files and bitmap resources into movable global memory.

#include <cstdio>
#include <cstring>

#include "vynutil/internal_util.h"
#include "win32/crt_stdio.h"
#include "win32/gdi.h"
#include "win32/global_memory.h"
#include "win32/resource.h"

namespace {

constexpr std::size_t kFileHeaderSize = 14;
constexpr WORD kBitmapSignature = 0x4D42;  // "BM"

// A new zero-filled movable block holding size bytes, filled by fill(address); null when
// allocation, locking or filling fails.
template <class Fill>
HDIB NewDibBlock(std::size_t size, std::size_t room, Fill fill) {
  HGLOBAL block = win32::GlobalAlloc(win32::GMEM_MOVEABLE | win32::GMEM_ZEROINIT, room);
  if (!block) return nullptr;
  void* address = win32::GlobalLock(block);
  const bool filled = (address || size == 0) && fill(address, size);
  win32::GlobalUnlock(block);
  if (!filled) {
    win32::GlobalFree(block);
    return nullptr;
  }
  return block;
}

// A 32-bit field of an information header (40 bytes or more: larger ones begin with it), or a
// 16-bit field of a core header.
DWORD HeaderDimension(const char* dib, std::size_t infoOffset, std::size_t coreOffset) {
  if (!dib) return 0;
  DWORD headerSize;
  std::memcpy(&headerSize, dib, 4);
  if (headerSize >= sizeof(win32::BITMAPINFOHEADER)) {
    DWORD value;
    std::memcpy(&value, dib + infoOffset, 4);
    return value;
  }
  WORD value;
  std::memcpy(&value, dib + coreOffset, 2);
  return value;
}

}  // namespace

namespace InternalUtil {

HDIB ReadDIBFile(MCHAR* path) {
  std::FILE* file = path ? win32::_wfopen(path, u"rb") : nullptr;
  if (!file) return nullptr;
  HDIB dib = nullptr;
  long length = -1;
  if (std::fseek(file, 0, SEEK_END) == 0) length = std::ftell(file);
  win32::BITMAPFILEHEADER header{};
  if (length >= 0 && std::fseek(file, 0, SEEK_SET) == 0 &&
      std::fread(&header, 1, kFileHeaderSize, file) == kFileHeaderSize &&
      header.bfType == kBitmapSignature && static_cast<std::size_t>(length) >= kFileHeaderSize) {
    // The block has room for the whole file; the DIB is what follows the file header.
    const std::size_t rest = static_cast<std::size_t>(length) - kFileHeaderSize;
    dib = NewDibBlock(rest, static_cast<std::size_t>(length), [file](void* to, std::size_t size) {
      return std::fread(to, 1, size, file) == size;
    });
  }
  std::fclose(file);
  return dib;
}

HDIB GetBitmap(HINSTANCE module, int id) {
  HRSRC resource = win32::FindResourceW(module, MAKEINTRESOURCEW(id), RT_BITMAP);
  if (!resource) return nullptr;
  const void* bytes = win32::LockResource(win32::LoadResource(module, resource));
  if (!bytes) return nullptr;
  const std::size_t size = win32::SizeofResource(module, resource);
  return NewDibBlock(size, size, [bytes](void* to, std::size_t n) {
    if (n) std::memcpy(to, bytes, n);
    return true;
  });
}

DWORD DIBWidth(char* dib) { return HeaderDimension(dib, 4, 4); }

DWORD DIBHeight(char* dib) { return HeaderDimension(dib, 8, 6); }

}  // namespace InternalUtil
