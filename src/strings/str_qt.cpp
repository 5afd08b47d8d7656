// CStr, WStr and UTF8Str: construction from, conversion to and comparison with QString.
//
// QString holds UTF-16, so WStr takes its units as they are (QString::utf16 and fromUtf16, the
// char16_t counterparts of toStdWString and fromWCharArray) and UTF8Str its UTF-8 encoding.
// CStr converts through UTF-16 in both directions rather than taking the UTF-8 bytes of
// QString::toStdString and reading its own bytes back with QString::fromLocal8Bit (UTF-8 here,
// not the narrow code page): made from a QString it holds the text in the narrow code page
// (characters the code page lacks become '?'), and as a QString its bytes are read in that code
// page, so text the code page can hold makes the round trip unchanged.

#include <QByteArray>
#include <QString>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;
using VynSDK::Util::VynString;

namespace {

// The QString's units up to its terminator; never null.
const MCHAR* UnitsOf(const QString& s) {
  const auto* units = reinterpret_cast<const MCHAR*>(s.utf16());
  return units ? units : u"";
}

// A new UTF-16 block of the QString's text, as the narrow code page's form.
char* NarrowOf(const QString& s) { return NarrowCore::FormOf(VynString::FromUTF16(UnitsOf(s))); }

}  // namespace

// ---- WStr -----------------------------------------------------------------------------------

WStr::WStr(const QString& s) : buf(WideCore::NewText(UnitsOf(s))) {}
WStr& WStr::operator=(const QString& s) {
  WideCore::Replace(buf, WideCore::NewText(UnitsOf(s)));
  return *this;
}
WStr::operator QString() const { return QString::fromUtf16(WideCore::Data(buf)); }
bool WStr::operator==(const QString& other) const { return *this == UnitsOf(other); }
bool WStr::operator!=(const QString& other) const { return !(*this == other); }
bool operator==(const QString& a, const WStr& b) { return b == a; }
bool operator!=(const QString& a, const WStr& b) { return b != a; }

// ---- CStr -----------------------------------------------------------------------------------

CStr::CStr(const QString& s) : buf(NarrowOf(s)) {}
CStr& CStr::operator=(const QString& s) {
  NarrowCore::Replace(buf, NarrowOf(s));
  return *this;
}
CStr::operator QString() const {
  const auto utf16 = ToUTF16();
  return QString::fromUtf16(utf16.Get() ? utf16.Get() : u"");
}
bool CStr::operator==(const QString& other) const { return *this == CStr(other); }
bool CStr::operator!=(const QString& other) const { return !(*this == other); }
bool operator==(const QString& a, const CStr& b) { return b == a; }
bool operator!=(const QString& a, const CStr& b) { return b != a; }

// ---- UTF8Str --------------------------------------------------------------------------------

UTF8Str::UTF8Str(const QString& s) : buf(Utf8Core::NewText(s.toUtf8().constData())) {}
UTF8Str& UTF8Str::operator=(const QString& s) {
  Utf8Core::Replace(buf, Utf8Core::NewText(s.toUtf8().constData()));
  return *this;
}
UTF8Str::operator QString() const { return QString::fromUtf8(Utf8Core::Data(buf)); }
bool UTF8Str::operator==(const QString& other) const {
  return Utf8Core::CompareText(buf, other.toUtf8().constData()) == 0;
}
bool UTF8Str::operator!=(const QString& other) const { return !(*this == other); }
bool operator==(const QString& a, const UTF8Str& b) { return b == a; }
bool operator!=(const QString& a, const UTF8Str& b) { return b != a; }
