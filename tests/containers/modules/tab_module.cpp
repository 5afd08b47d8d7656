// A second module for the Tab tests: it has its own copy of the Tab template, so blocks grown
// or freed here cross a module boundary.

#include "vynutil/tab.h"

extern "C" __attribute__((visibility("default"))) void TabModuleAppend(Tab<int>* tab, int from,
                                                                       int count) {
  for (int value = from; value < from + count; ++value) tab->Append(1, &value, 0);
}

extern "C" __attribute__((visibility("default"))) Tab<int>* TabModuleNewTab() {
  return new Tab<int>;
}

extern "C" __attribute__((visibility("default"))) void TabModuleDeleteTab(Tab<int>* tab) {
  delete tab;
}

extern "C" __attribute__((visibility("default"))) int TabModuleThrowOutOfRange(const Tab<int>* tab) {
  return (*tab)[tab->Count()];
}
