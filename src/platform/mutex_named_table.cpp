// The process's table of open named mutexes.

#include "mutex_named_table.h"

#include <cstddef>
#include <cstdlib>
#include <functional>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>

#include "mutex_lingering.h"
#include "win32/last_error.h"

namespace win32::detail {

struct NamedMutex {
  bool global = false;
  std::u16string name;
  std::unique_ptr<SharedMutexObject> object;
  std::size_t handles = 0;  // guarded by the table's lock
};

MutexState* StateOf(const NamedMutex& named) { return named.object->state(); }

namespace {

struct NameHash {
  std::size_t operator()(const MutexName& name) const {
    return std::hash<std::u16string_view>{}(name.name) ^ static_cast<std::size_t>(name.global);
  }
};

struct NameEqual {
  bool operator()(const MutexName& a, const MutexName& b) const {
    return a.global == b.global && a.name == b.name;
  }
};

struct Table {
  std::mutex lock;
  // Each key views the name kept in its own entry.
  std::unordered_map<MutexName, std::unique_ptr<NamedMutex>, NameHash, NameEqual> open;
};

void RemoveUnusedAtExit();

// Never destroyed: handles may be closed from static destructors of other objects.
Table& Names() {
  static Table* table = [] {
    std::atexit(RemoveUnusedAtExit);
    return new Table;
  }();
  return *table;
}

// The mutexes still open at exit: their files go unless another process uses them (the mappings
// stay for whatever runs after this). A thread that holds the table's lock at exit may be
// waiting for another process; the files then stay, to be started afresh by their next user.
void RemoveUnusedAtExit() {
  Table& table = Names();
  std::unique_lock<std::mutex> lock(table.lock, std::try_to_lock);
  if (!lock.owns_lock()) return;
  for (auto& [name, named] : table.open) named->object->RemoveIfUnused();
}

}  // namespace

DWORD AddNamedMutexHandle(const MutexName& name, SharedMutexObject::Mode mode, bool initialOwner,
                          NamedMutex** named, bool* existed) {
  Table& table = Names();
  // Joining happens under the lock, so one name never gets two mappings in the process; other
  // names wait for the few system calls that takes.
  std::lock_guard<std::mutex> lock(table.lock);
  if (auto found = table.open.find(name); found != table.open.end()) {
    ++found->second->handles;
    *named = found->second.get();
    *existed = true;
    return ERROR_SUCCESS;
  }
  auto entry = std::make_unique<NamedMutex>();
  bool created = false;
  const DWORD error =
      SharedMutexObject::Join(SharedMutexFileName(name), mode, initialOwner, &entry->object, &created);
  if (error != ERROR_SUCCESS) return error;
  entry->global = name.global;
  entry->name = name.name;
  entry->handles = 1;
  *named = entry.get();
  *existed = !created;
  const MutexName key{entry->global, entry->name};
  table.open.emplace(key, std::move(entry));
  return ERROR_SUCCESS;
}

void RemoveNamedMutexHandle(NamedMutex* named) {
  std::unique_ptr<NamedMutex> last;
  {
    Table& table = Names();
    std::lock_guard<std::mutex> lock(table.lock);
    if (--named->handles > 0) return;
    auto found = table.open.find(MutexName{named->global, named->name});
    last = std::move(found->second);
    table.open.erase(found);
  }
  // Leaving takes system calls and may wait for another process: outside the table's lock.
  NamedMutex* closed = last.release();
  ReleaseWhenUnowned(StateOf(*closed), [closed] { delete closed; });
}

}  // namespace win32::detail
