#pragma once
// Rules that transform INI values on their way in and out: folder paths are stored with
// %NAME% references and the installation's location as a token, and handed to the code fully
// expanded. A rule set is an ordered list of rules, each guarded by selectors on the INI file,
// the section and the key. Texts are UTF-16; patterns are ECMAScript regular expressions.

#include <list>
#include <memory>
#include <regex>
#include <string>

#include "vynutil/export.h"
#include "vynutil/util_logger.h"
#include "vynutil/wintypes.h"

namespace Util {

// The base rule: accepts everything and changes nothing.
class VYN_API WindowsInitializationFileRule {
 public:
  enum Status { Ok = 0, Rejected = 1 };
  struct ProcessResult {
    Status status = Ok;
    std::u16string value;
  };

  virtual ~WindowsInitializationFileRule();
  // Whether value is acceptable for the key; findings are reported to logger.
  virtual Status Validate(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                          const std::u16string& value, Logger& logger) const;
  // The value as the code should see it, after reading.
  virtual ProcessResult ProcessPostRead(const std::u16string& file, const std::u16string& section,
                                        const std::u16string& key, const std::u16string& value) const;
  // The value to store when newValue is written; rawValue is what the file (or the expansion
  // memory) holds now, unexpanded.
  virtual ProcessResult ProcessPreWrite(const std::u16string& file, const std::u16string& section,
                                        const std::u16string& key, const std::u16string& rawValue,
                                        const std::u16string& newValue) const;
};

// Folder values with %NAME% references: expanded on read. Validation flags: 1 reports a value
// still holding a reference after expansion, 2 a value that names no existing path.
class VYN_API PathWithEnvVarExpansion : public WindowsInitializationFileRule {
 public:
  explicit PathWithEnvVarExpansion(unsigned short validationFlags = 1);
  Status Validate(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                  const std::u16string& value, Logger& logger) const override;
  ProcessResult ProcessPostRead(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                                const std::u16string& value) const override;

 private:
  unsigned short m_flags;
};

// Folder values whose unexpanded form is protected: the expansion read is remembered, and
// writing back the same folder (in any case, with or without a trailing separator) stores the
// unexpanded text again; writing another folder is rejected and the file keeps its text.
class VYN_API PathWithProtectedEnvVarExpansion : public WindowsInitializationFileRule {
 public:
  explicit PathWithProtectedEnvVarExpansion(unsigned short validationFlags = 3);
  Status Validate(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                  const std::u16string& value, Logger& logger) const override;
  ProcessResult ProcessPostRead(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                                const std::u16string& value) const override;
  ProcessResult ProcessPreWrite(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                                const std::u16string& rawValue, const std::u16string& newValue) const override;

 private:
  unsigned short m_flags;
};

// Written values get "\" for "/" and every occurrence of a text (any case, matched literally)
// replaced by a token, e.g. the installation folder by %ROOT%. The token is an ECMAScript
// replacement format ($& and the like are interpreted).
class VYN_API Tokenize : public WindowsInitializationFileRule {
 public:
  Tokenize(const std::u16string& tokenizeFrom, const std::u16string& tokenizeTo);
  ~Tokenize() override;
  ProcessResult ProcessPreWrite(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                                const std::u16string& rawValue, const std::u16string& newValue) const override;

 private:
  struct Impl;
  std::unique_ptr<Impl> m_impl;
};

// How a selector picks names: everything, one exact text, or a whole-text regular expression
// (case-insensitive). The pattern is not owned; it is copied when a rule is registered.
class VYN_API SelectionMethod {
 public:
  enum Method { All = 0, String = 1, Regex = 2 };
  SelectionMethod() = default;
  SelectionMethod(Method method, const MCHAR* pattern);

  const MCHAR* Pattern() const { return m_pattern; }
  Method GetMethod() const { return m_method; }

 private:
  const MCHAR* m_pattern = u"";
  Method m_method = All;
};

// Selectors made from selection methods at registration.
class VYN_API Selector {
 public:
  virtual ~Selector();
  // Selector itself matches everything.
  virtual bool Match(const std::u16string& text) const;
};

class VYN_API StringSelector : public Selector {
 public:
  explicit StringSelector(const std::u16string& pattern);
  // Same length and same units (case counts).
  bool Match(const std::u16string& text) const override;

 private:
  std::u16string m_pattern;
};

class VYN_API RegexSelector : public Selector {
 public:
  explicit RegexSelector(const std::u16string& pattern);
  // The whole text matches the pattern, case-insensitively.
  bool Match(const std::u16string& text) const override;

 private:
  std::wregex m_regex;
};

// An ordered list of rules, each with its file, section and key selectors. The file selector is
// given the file name in its key form (see IniRuleSetMapper); section and key as passed.
class VYN_API IniRuleSet {
 public:
  IniRuleSet();
  ~IniRuleSet();
  IniRuleSet(const IniRuleSet&) = delete;
  IniRuleSet& operator=(const IniRuleSet&) = delete;

  // Appends a rule; the set takes it.
  void Register(const SelectionMethod& file, const SelectionMethod& section, const SelectionMethod& key,
                std::unique_ptr<WindowsInitializationFileRule> rule);
  // Appends a folder rule for the selectors: protected expansion (flags 3) when protect, plain
  // expansion (flags 1) otherwise, followed by Tokenize(tokenizeFrom, tokenizeTo).
  void RegisterDirectory(const std::u16string& tokenizeFrom, const std::u16string& tokenizeTo,
                         const SelectionMethod& file, const SelectionMethod& section, const SelectionMethod& key,
                         bool protect);

  // The first status other than Ok of the rules that apply, else Ok.
  WindowsInitializationFileRule::Status Validate(const std::u16string& file, const std::u16string& section,
                                                 const std::u16string& key, const std::u16string& value,
                                                 Logger& logger) const;
  // The value passed through the rules that apply, in order; the first rejection ends the chain
  // with that rule's result.
  WindowsInitializationFileRule::ProcessResult ProcessPostRead(const std::u16string& file,
                                                               const std::u16string& section,
                                                               const std::u16string& key,
                                                               const std::u16string& value) const;
  WindowsInitializationFileRule::ProcessResult ProcessPreWrite(const std::u16string& file,
                                                               const std::u16string& section,
                                                               const std::u16string& key,
                                                               const std::u16string& rawValue,
                                                               const std::u16string& newValue) const;

  // The processed value of a read; a rejection is logged (message 157) and value comes back.
  std::u16string PostReadPrivateProfileString(const MCHAR* section, const MCHAR* key, const MCHAR* value,
                                              const MCHAR* file) const;
  // The value to write for value, starting from the remembered raw text (value when none); a
  // rejection is logged (message 156) and the raw text comes back.
  std::u16string PreWritePrivateProfileString(const MCHAR* section, const MCHAR* key, const MCHAR* value,
                                              const MCHAR* file) const;

  // Validates every key=value line of every section of file; true when all are Ok.
  bool ValidateIniFile(const MCHAR* file, Logger& logger) const;
  bool ValidateIniFile(const MCHAR* file, Logger&& logger) const;

 private:
  struct Entry;
  std::list<Entry> m_entries;
};

}  // namespace Util
