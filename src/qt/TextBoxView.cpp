#include "qt/TextBoxView.h"

#include <QApplication>
#include <QClipboard>
#include <QKeyEvent>

#include "platform/forms/Form.h"
#include "platform/forms/Utf8.h"
#include "qt/FormWindow.h"
#include "qt/QtText.h"

namespace dvqt {

namespace {

Qt::Alignment AlignmentOf(int alignment) {
  switch (alignment) {
    case forms::vbRightJustify: return Qt::AlignRight | Qt::AlignVCenter;
    case forms::vbCenter: return Qt::AlignHCenter | Qt::AlignVCenter;
    default: return Qt::AlignLeft | Qt::AlignVCenter;
  }
}

bool IsSelectionMove(const QKeyEvent& event) {
  if ((event.modifiers() & Qt::ShiftModifier) == 0) return false;
  switch (event.key()) {
    case Qt::Key_Left:
    case Qt::Key_Right:
    case Qt::Key_Home:
    case Qt::Key_End: return true;
    default: return false;
  }
}

}  // namespace

TextBoxView::TextBoxView(FormWindow& window, forms::TextBox& box)
    : ControlView(window, box, new QLineEdit(window.client())), box_(box),
      edit_(static_cast<QLineEdit*>(widget())) {
  edit_->setContextMenuPolicy(Qt::NoContextMenu);
  edit_->setDragEnabled(false);
  edit_->setFrame(true);
}

void TextBoxView::SyncText() {
  QString text = ToQ(box_.Text());
  if (edit_->text() != text) {
    QSignalBlocker blocker(edit_);
    edit_->setText(text);
  }
}

void TextBoxView::SyncSelection() {
  if (pushing_) return;
  QString text = edit_->text();
  int start = Utf16Index(text, box_.SelStart());
  int end = Utf16Index(text, box_.SelStart() + box_.SelLength());
  QSignalBlocker blocker(edit_);
  if (end > start) {
    // A selection made backwards keeps its caret where it is.
    if (edit_->selectionStart() != start || edit_->selectionEnd() != end)
      edit_->setSelection(start, end - start);
  } else if (edit_->hasSelectedText() || edit_->cursorPosition() != start) {
    edit_->deselect();
    edit_->setCursorPosition(start);
  }
}

bool TextBoxView::SyncOwn(std::string_view property) {
  if (property == "Text") {
    SyncText();
    SyncSelection();
  } else if (property == "SelStart" || property == "SelLength") {
    SyncSelection();
  } else if (property == "Locked") {
    edit_->setReadOnly(box_.Locked());
  } else if (property == "Alignment") {
    edit_->setAlignment(AlignmentOf(box_.Alignment()));
  } else {
    return false;
  }
  return true;
}

void TextBoxView::SyncOwnAll() {
  edit_->setReadOnly(box_.Locked());
  edit_->setAlignment(AlignmentOf(box_.Alignment()));
  SyncText();
  SyncSelection();
}

void TextBoxView::PushSelection() {
  if (!this->window().Live()) return;
  QString text = edit_->text();
  int start = edit_->hasSelectedText() ? edit_->selectionStart() : edit_->cursorPosition();
  int end = edit_->hasSelectedText() ? edit_->selectionEnd() : start;
  auto from = static_cast<int32_t>(CodePointIndex(text, start));
  auto length = static_cast<int32_t>(CodePointIndex(text, end)) - from;
  if (box_.SelStart() == from && box_.SelLength() == length) return;
  pushing_ = true;
  box_.SetSelStart(from);
  box_.SetSelLength(length);
  pushing_ = false;
  SyncSelection();
}

bool TextBoxView::ClipboardKey(QKeyEvent& event, const Keystroke& stroke) {
  enum class Action { None, Copy, Cut, Paste, SelectAll } action = Action::None;
  if (event.matches(QKeySequence::Copy)) action = Action::Copy;
  else if (event.matches(QKeySequence::Cut)) action = Action::Cut;
  else if (event.matches(QKeySequence::Paste)) action = Action::Paste;
  else if (event.matches(QKeySequence::SelectAll)) action = Action::SelectAll;
  if (action == Action::None) return false;
  // KeyDown sees the shortcut as any other key; the edit happens only when the box is
  // still the focused one afterwards.
  Input([&] {
    forms::Form& owner = form();
    owner.KeyStroke(stroke.keyCode, stroke.shift, 0);
    if (!owner.Loaded() || owner.ActiveControl() != &box_) return;
    QClipboard* clipboard = QApplication::clipboard();
    switch (action) {
      case Action::Copy:
        if (box_.SelLength() > 0) clipboard->setText(ToQ(box_.SelText()));
        break;
      case Action::Cut:
        if (box_.SelLength() > 0 && !box_.Locked()) {
          clipboard->setText(ToQ(box_.SelText()));
          box_.SetSelText({});
        }
        break;
      case Action::Paste: {
        if (box_.Locked()) break;
        // A single-line box takes the first line, and no more than MaxLength allows.
        std::string pasted = FromQ(clipboard->text().section(QLatin1Char('\n'), 0, 0).remove(QLatin1Char('\r')));
        if (int32_t limit = box_.MaxLength(); limit > 0) {
          auto room = limit - static_cast<int32_t>(forms::utf8::Length(box_.Text())) + box_.SelLength();
          room = std::max<int32_t>(room, 0);
          pasted.resize(forms::utf8::Offset(pasted, static_cast<size_t>(room)));
        }
        if (!pasted.empty() || box_.SelLength() > 0) box_.SetSelText(pasted);
        break;
      }
      case Action::SelectAll:
        box_.SetSelStart(0);
        box_.SetSelLength(static_cast<int32_t>(forms::utf8::Length(box_.Text())));
        break;
      case Action::None: break;
    }
  });
  return true;
}

bool TextBoxView::OnKey(QKeyEvent& event) {
  auto stroke = TranslateKey(event);
  if (!stroke) return true;
  if (ClipboardKey(event, *stroke)) return true;
  if (IsSelectionMove(event)) {
    // The model moves a caret but keeps no selection anchor: the line edit extends the
    // selection, and the model takes it over.
    KeyThroughWidget(event, *stroke, [this] { PushSelection(); });
    return true;
  }
  KeyToModel(*stroke);
  return true;
}

}  // namespace dvqt
