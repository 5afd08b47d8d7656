// Converts a line of Japanese text from UTF-8 to code page 932 and back with the installed
// library, and says whether the text came back unchanged (exit status 0) or not (1).

#include <cstdio>
#include <cstring>

#include <vynutil/vynstring.h>

int main() {
  using VynSDK::Util::VynString;

  const char* text = "こんにちは、世界。";  // UTF-8
  const VynString greeting = VynString::FromUTF8(text);

  std::size_t shiftJisBytes = 0;
  std::size_t utf16Units = 0;
  const auto shiftJis = greeting.ToCP(932, &shiftJisBytes);
  greeting.ToUTF16(&utf16Units);

  const VynString back = VynString::FromCP(932, shiftJis, shiftJisBytes);
  const bool same = std::strcmp(back.ToUTF8(), text) == 0;
  std::printf("%s: %zu UTF-8 bytes, %zu UTF-16 units, %zu bytes in code page 932; round trip %s\n",
              text, std::strlen(text), utf16Units, shiftJisBytes, same ? "exact" : "changed the text");
  return same ? 0 : 1;
}
