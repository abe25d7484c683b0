// The component's own numbered user-interface texts (1 to 100): menu captions, status-line
// messages, questions and warnings, names of document kinds and states, in English and Estonian.
// Document logic refers to them by number only and fills their "%s" placeholders through
// GetUIString. The language follows CurrentLangID, which like all module state is per thread.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <span>
#include <string>
#include <string_view>

#include "runtime/variant.h"

namespace xal {

// Language identifiers that select a column of the table; any other identifier reads English.
enum UILanguage : int32_t {
  kLangEnglish = 3,
  kLangEstonian = 4,
  kLangThird = 5,  // a third language column that repeats the English texts
};

// The language of this thread's component (0 until set). DocFunc.Create sets it from the host;
// it is also the language the component asks the host's message look-up for.
int32_t CurrentLangID();
void SetCurrentLangID(int32_t langId);

// Text `number` in the current language. Without arguments the text comes back as stored, "%s"
// and all. With arguments the text is cut at each "%s" and pieces and arguments are interleaved:
// an argument without a placeholder is appended at the end, a placeholder without an argument is
// dropped, and a Null argument adds nothing. Numbers outside 1..100 give "".
std::string GetUIString(int32_t number, std::span<const Variant> args);
inline std::string GetUIString(int32_t number, std::initializer_list<Variant> args = {}) {
  return GetUIString(number, std::span<const Variant>(args.begin(), args.size()));
}

// `text` with each "%s" replaced, in order, by the next argument: an argument without a
// placeholder is appended at the end, a placeholder without an argument is dropped. Every
// message table of the component (these texts, the period-closing texts) fills its texts so.
std::string FillPlaceholders(std::string_view text, std::span<const std::string> args);

// Whether this thread has built its table yet (it is built on the first valid look-up).
bool UIStringTableBuilt();

}  // namespace xal
