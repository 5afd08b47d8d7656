// VynString: life cycle, creation, writable buffers and reading of forms.

#include "vynutil/vynstring.h"

#include "strings/string_errors.h"
#include "strings/vynstring_data.h"
#include "win32/codepage.h"
#include "win32/oleaut.h"

namespace VynSDK::Util {

namespace SB = StringBlocks;

// ---- life cycle -------------------------------------------------------------------------------

VynString::VynString(const VynString& other) noexcept : m_data(other.m_data) {
  if (m_data) SB::AddRef(m_data);
}

VynString& VynString::operator=(const VynString& other) noexcept {
  if (m_data == other.m_data) return *this;
  VynStringData* old = m_data;
  m_data = other.m_data;
  if (m_data) SB::AddRef(m_data);
  if (old) SB::Release(old);
  return *this;
}

VynString& VynString::operator=(VynString&& other) noexcept {
  if (this == &other) return *this;
  VynStringData* old = m_data;
  m_data = std::exchange(other.m_data, nullptr);
  if (old) SB::Release(old);
  return *this;
}

VynString& VynString::operator=(VynStringData* data) noexcept {
  if (m_data == data) return *this;
  VynStringData* old = m_data;
  m_data = data;
  if (old) SB::Release(old);
  return *this;
}

VynString::~VynString() {
  if (m_data) SB::Release(m_data);
}

void VynString::SetNull() noexcept { *this = static_cast<VynStringData*>(nullptr); }

// ---- creation ---------------------------------------------------------------------------------

UINT VynString::NormalizeCP(UINT codepage) {
  switch (codepage) {
    case CP_ACP: return win32::GetACP();
    case CP_OEMCP: return win32::GetOEMCP();
    case CP_MACCP:
    case CP_THREAD_ACP: {
      LCID locale = codepage == CP_MACCP ? win32::LOCALE_SYSTEM_DEFAULT : win32::GetThreadLocale();
      DWORD type = win32::LOCALE_RETURN_NUMBER |
                   (codepage == CP_MACCP ? win32::LOCALE_IDEFAULTMACCODEPAGE : win32::LOCALE_IDEFAULTANSICODEPAGE);
      DWORD value = 0;
      win32::GetLocaleInfoW(locale, type, reinterpret_cast<MCHAR*>(&value), sizeof(value) / sizeof(MCHAR));
      return value;
    }
    default: return codepage;
  }
}

VynString VynString::FromCP(UINT codepage, const char* s, std::size_t len) {
  if (!s) return VynString();
  return VynString(SB::FromUnits(NormalizeCP(codepage), s, len));
}

VynString VynString::FromACP(const char* s, std::size_t len) { return FromCP(CP_ACP, s, len); }
VynString VynString::FromUTF8(const char* s, std::size_t len) { return FromCP(CP_UTF8, s, len); }

VynString VynString::FromUTF16(const MCHAR* s, std::size_t len) {
  if (!s) return VynString();
  return VynString(SB::FromUnits(CP_UTF16, s, len));
}

VynString VynString::FromBSTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
VynString VynString::FromMCHAR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
VynString VynString::FromOLESTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }

VynString VynString::FromUTF32(const unsigned int* s, std::size_t len) {
  if (!s) return VynString();
  return VynString(SB::FromUnits(CP_UTF32, s, len));
}

void VynString::SetCP(UINT codepage, const char* s, std::size_t len) { *this = FromCP(codepage, s, len); }
void VynString::SetACP(const char* s, std::size_t len) { *this = FromCP(CP_ACP, s, len); }
void VynString::SetUTF8(const char* s, std::size_t len) { *this = FromCP(CP_UTF8, s, len); }
void VynString::SetUTF16(const MCHAR* s, std::size_t len) { *this = FromUTF16(s, len); }

// ---- writable buffers -------------------------------------------------------------------------

namespace {

template <class Unit>
Unit* AllocUnits(VynString& str, VynStringData*& slot, UINT encoding, std::size_t n) {
  if (n > SIZE_MAX / sizeof(Unit)) throw std::bad_array_new_length();
  VynStringData* data = SB::Allocate(encoding, n * sizeof(Unit));
  VynStringData* old = std::exchange(slot, data);
  if (old) SB::Release(old);
  return reinterpret_cast<Unit*>(data->primary.Chars());
}

}  // namespace

char* VynString::AllocBufferCP(UINT codepage, std::size_t n) {
  if ((codepage & CP_ENCODING_MASK) == CP_UTF16 || (codepage & CP_ENCODING_MASK) == CP_UTF32) {
    ThrowAllocBufferUtfTag();
  }
  return AllocUnits<char>(*this, m_data, NormalizeCP(codepage), n);
}

char* VynString::AllocBufferACP(std::size_t n) { return AllocBufferCP(CP_ACP, n); }
char* VynString::AllocBufferUTF8(std::size_t n) { return AllocBufferCP(CP_UTF8, n); }
MCHAR* VynString::AllocBufferUTF16(std::size_t n) { return AllocUnits<MCHAR>(*this, m_data, CP_UTF16, n); }
MCHAR* VynString::AllocBuffer(std::size_t n) { return AllocBufferUTF16(n); }
unsigned int* VynString::AllocBufferUTF32(std::size_t n) {
  return AllocUnits<unsigned int>(*this, m_data, CP_UTF32, n);
}

// ---- reading ----------------------------------------------------------------------------------

namespace {

// The characters of the form in the (normalised) encoding and their length in units.
const char* FormChars(VynStringData* data, UINT encoding, std::size_t* len) {
  if (!data) {
    if (len) *len = 0;
    return nullptr;
  }
  EncodedForm* form = SB::FindOrMakeForm(data, encoding);
  if (len) *len = SB::UnitLength(form->Chars(), SB::UnitSize(form->encoding));
  return form->Chars();
}

template <class Cast, class Unit = char>
Cast Read(const VynString& str, VynStringData* data, UINT encoding, std::size_t* len) {
  const char* chars = FormChars(data, encoding, len);
  return Cast(str, reinterpret_cast<const Unit*>(chars));
}

template <class Cast, class Unit = char>
Cast ReadMoving(VynString&& str, VynStringData* data, UINT encoding, std::size_t* len) {
  const char* chars = FormChars(data, encoding, len);
  return Cast(std::move(str), reinterpret_cast<const Unit*>(chars));
}

}  // namespace

VynStringCastCP VynString::ToCP(UINT codepage, std::size_t* len) const& {
  return Read<VynStringCastCP>(*this, m_data, NormalizeCP(codepage), len);
}
VynStringCastCP VynString::ToCP(UINT codepage, std::size_t* len) && {
  return ReadMoving<VynStringCastCP>(std::move(*this), m_data, NormalizeCP(codepage), len);
}
VynStringCast<char> VynString::ToACP(std::size_t* len) const& {
  return Read<VynStringCast<char>>(*this, m_data, NormalizeCP(CP_ACP), len);
}
VynStringCast<char> VynString::ToACP(std::size_t* len) && {
  return ReadMoving<VynStringCast<char>>(std::move(*this), m_data, NormalizeCP(CP_ACP), len);
}
VynStringCastUTF8 VynString::ToUTF8(std::size_t* len) const& {
  return Read<VynStringCastUTF8>(*this, m_data, CP_UTF8, len);
}
VynStringCastUTF8 VynString::ToUTF8(std::size_t* len) && {
  return ReadMoving<VynStringCastUTF8>(std::move(*this), m_data, CP_UTF8, len);
}
VynStringCast<MCHAR> VynString::ToUTF16(std::size_t* len) const& {
  return Read<VynStringCast<MCHAR>, MCHAR>(*this, m_data, CP_UTF16, len);
}
VynStringCast<MCHAR> VynString::ToUTF16(std::size_t* len) && {
  return ReadMoving<VynStringCast<MCHAR>, MCHAR>(std::move(*this), m_data, CP_UTF16, len);
}
VynStringCast<MCHAR> VynString::ToMCHAR(std::size_t* len) const& { return ToUTF16(len); }
VynStringCast<MCHAR> VynString::ToOLESTR(std::size_t* len) const& { return ToUTF16(len); }
VynStringCast<unsigned int> VynString::ToUTF32(std::size_t* len) const& {
  return Read<VynStringCast<unsigned int>, unsigned int>(*this, m_data, CP_UTF32, len);
}
VynStringCast<unsigned int> VynString::ToUTF32(std::size_t* len) && {
  return ReadMoving<VynStringCast<unsigned int>, unsigned int>(std::move(*this), m_data, CP_UTF32, len);
}

BSTR VynString::ToBSTR() const {
  const char* chars = FormChars(m_data, CP_UTF16, nullptr);
  return win32::SysAllocString(chars ? reinterpret_cast<const MCHAR*>(chars) : u"");
}

std::size_t VynString::Length(UINT codepage) const {
  std::size_t len = 0;
  FormChars(m_data, NormalizeCP(codepage), &len);
  return len;
}

std::size_t VynString::AllocatedChars() const noexcept {
  if (!m_data) return 0;
  return m_data->bufferBytes / SB::UnitSize(m_data->primary.encoding);
}

std::size_t VynString::ConversionCount() const noexcept {
  if (!m_data) return 0;
  std::size_t count = 0;
  for (const EncodedForm* form = &m_data->primary; form; form = form->next.load(std::memory_order_acquire)) {
    ++count;
  }
  return count;
}

UINT VynString::PrimaryCP() const noexcept { return m_data ? m_data->primary.encoding : 0; }

}  // namespace VynSDK::Util
