#pragma once
// Pins the process code pages for one test and returns them to their defaults afterwards, also
// when the test fails part-way.

#include "win32/codepage.h"

class ProcessCodePages {
 public:
  ProcessCodePages(UINT acp, UINT oemcp) { win32::SetProcessCodePages(acp, oemcp); }
  ~ProcessCodePages() { win32::SetProcessCodePages(0, 0); }
  ProcessCodePages(const ProcessCodePages&) = delete;
  ProcessCodePages& operator=(const ProcessCodePages&) = delete;
};
