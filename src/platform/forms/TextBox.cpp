#include "platform/forms/TextBox.h"

#include <algorithm>

#include "platform/forms/Utf8.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

const PropertyTable<TextBox>& Properties() {
  static const PropertyTable<TextBox> table = {
      {"text",
       {[](TextBox& c) { return vb::Variant(c.Text()); },
        [](TextBox& c, const vb::Variant& v) { c.SetText(vb::CStr(v)); }}},
      {"locked",
       {[](TextBox& c) { return vb::Variant(c.Locked()); },
        [](TextBox& c, const vb::Variant& v) { c.SetLocked(vb::CBool(v)); }}},
      {"alignment",
       {[](TextBox& c) { return vb::Variant(int32_t{c.Alignment()}); },
        [](TextBox& c, const vb::Variant& v) { c.SetAlignment(vb::CLng(v)); }}},
      {"maxlength",
       {[](TextBox& c) { return vb::Variant(c.MaxLength()); },
        [](TextBox& c, const vb::Variant& v) { c.SetMaxLength(vb::CLng(v)); }}},
      {"selstart",
       {[](TextBox& c) { return vb::Variant(c.SelStart()); },
        [](TextBox& c, const vb::Variant& v) { c.SetSelStart(vb::CLng(v)); }}},
      {"sellength",
       {[](TextBox& c) { return vb::Variant(c.SelLength()); },
        [](TextBox& c, const vb::Variant& v) { c.SetSelLength(vb::CLng(v)); }}},
      {"seltext",
       {[](TextBox& c) { return vb::Variant(c.SelText()); },
        [](TextBox& c, const vb::Variant& v) { c.SetSelText(vb::CStr(v)); }}},
  };
  return table;
}

}  // namespace

const std::string& TextBox::Text() const { Touch(); return state_.text; }

void TextBox::SetText(std::string text) {
  Touch();
  if (state_.text == text) return;
  state_.text = std::move(text);
  // Windows puts the caret at the start of a text set by code.
  state_.selStart = 0;
  state_.selLength = 0;
  Changed("Text");
  Raise(Change);
}

bool TextBox::Locked() const { Touch(); return state_.locked; }
void TextBox::SetLocked(bool locked) {
  Touch();
  if (state_.locked == locked) return;
  state_.locked = locked;
  Changed("Locked");
}

int TextBox::Alignment() const { Touch(); return state_.alignment; }
void TextBox::SetAlignment(int alignment) {
  Touch();
  if (alignment < vbLeftJustify || alignment > vbCenter)
    throw vb::Error(380, "Invalid property value");
  if (state_.alignment == alignment) return;
  state_.alignment = alignment;
  Changed("Alignment");
}

int32_t TextBox::MaxLength() const { Touch(); return state_.maxLength; }
void TextBox::SetMaxLength(int32_t maxLength) {
  Touch();
  if (maxLength < 0) throw vb::Error(380, "Invalid property value");
  if (state_.maxLength == maxLength) return;
  state_.maxLength = maxLength;
  Changed("MaxLength");
}

int32_t TextBox::Length() const { return static_cast<int32_t>(utf8::Length(state_.text)); }

int32_t TextBox::SelStart() const { Touch(); return state_.selStart; }
void TextBox::SetSelStart(int32_t start) {
  Touch();
  if (start < 0) throw vb::Error(380, "Invalid property value");
  state_.selStart = std::min(start, Length());
  state_.selLength = 0;
  Changed("SelStart");
}

int32_t TextBox::SelLength() const { Touch(); return state_.selLength; }
void TextBox::SetSelLength(int32_t length) {
  Touch();
  if (length < 0) throw vb::Error(380, "Invalid property value");
  state_.selLength = std::min(length, Length() - state_.selStart);
  Changed("SelLength");
}

std::string TextBox::SelText() const {
  Touch();
  size_t from = utf8::Offset(state_.text, static_cast<size_t>(state_.selStart));
  size_t to = utf8::Offset(state_.text, static_cast<size_t>(state_.selStart + state_.selLength));
  return state_.text.substr(from, to - from);
}

void TextBox::SetSelText(const std::string& text) {
  Touch();
  ReplaceSelection(text);
}

void TextBox::EditTo(std::string text, int32_t caret) {
  bool changed = text != state_.text;
  state_.text = std::move(text);
  state_.selStart = caret;
  state_.selLength = 0;
  if (!changed) return;
  Changed("Text");
  Raise(Change);
}

void TextBox::ReplaceSelection(const std::string& text) {
  size_t from = utf8::Offset(state_.text, static_cast<size_t>(state_.selStart));
  size_t to = utf8::Offset(state_.text, static_cast<size_t>(state_.selStart + state_.selLength));
  std::string edited = state_.text.substr(0, from) + text + state_.text.substr(to);
  EditTo(std::move(edited), state_.selStart + static_cast<int32_t>(utf8::Length(text)));
}

void TextBox::CharacterTyped(int keyAscii) {
  Touch();
  if (state_.locked) return;
  if (keyAscii == vbKeyBack) {
    if (state_.selLength == 0) {
      if (state_.selStart == 0) return;
      --state_.selStart;
      state_.selLength = 1;
    }
    ReplaceSelection({});
    return;
  }
  // Enter, Escape and the other control characters put nothing into a one-line box.
  if (keyAscii < 32) return;
  if (state_.maxLength > 0 && Length() - state_.selLength + 1 > state_.maxLength) return;
  ReplaceSelection(utf8::Encode(keyAscii));
}

void TextBox::KeyAction(int keyCode, int shift) {
  Touch();
  switch (keyCode) {
    case vbKeyLeft:
      state_.selStart = state_.selLength > 0 ? state_.selStart : std::max(0, state_.selStart - 1);
      state_.selLength = 0;
      break;
    case vbKeyRight:
      state_.selStart = std::min(Length(), state_.selStart + std::max(state_.selLength, 1));
      state_.selLength = 0;
      break;
    case vbKeyHome:
      state_.selStart = state_.selLength = 0;
      break;
    case vbKeyEnd:
      state_.selStart = Length();
      state_.selLength = 0;
      break;
    case vbKeyDelete:
      if (state_.locked) return;
      if (state_.selLength == 0) {
        if (state_.selStart >= Length()) return;
        state_.selLength = 1;
      }
      ReplaceSelection({});
      return;
    default:
      return;
  }
  Changed("SelStart");
}

vb::Variant TextBox::Get(const std::string& name) {
  if (auto row = Properties().find(LowerName(name)); row != Properties().end())
    return row->second.get(*this);
  return Control::Get(name);
}

void TextBox::Let(const std::string& name, const vb::Variant& value) {
  if (auto row = Properties().find(LowerName(name)); row != Properties().end())
    return row->second.let(*this, value);
  Control::Let(name, value);
}

}  // namespace forms
