#include "qt/Icons.h"

#include <QDir>
#include <QPainter>
#include <QPainterPath>
#include <QPixmap>
#include <array>
#include <string_view>

#include "qt/QtText.h"

namespace dvqt {

namespace {

enum class Glyph { Page, Folder, OpenFolder, Disk, Cross, Check, Unlock, Door, List, Import, Find, Letter };

struct KnownKey {
  std::string_view key;
  std::array<const char*, 3> themeNames;
  Glyph glyph;
};

// The commands of our toolbars and the icon names the freedesktop themes give them.
constexpr std::array<KnownKey, 15> kKnownKeys{{
    {"novo", {"document-new", "list-add", nullptr}, Glyph::Page},
    {"abrir", {"document-open", "document-edit", nullptr}, Glyph::OpenFolder},
    {"gravar", {"document-save", nullptr, nullptr}, Glyph::Disk},
    {"remover", {"list-remove", "edit-delete", nullptr}, Glyph::Cross},
    {"apagar", {"edit-delete", "user-trash", nullptr}, Glyph::Cross},
    {"eliminar", {"edit-delete", "user-trash", nullptr}, Glyph::Cross},
    {"fechar", {"window-close", "application-exit", nullptr}, Glyph::Door},
    {"sair", {"application-exit", "window-close", nullptr}, Glyph::Door},
    {"finalizar", {"object-locked", "dialog-ok", nullptr}, Glyph::Check},
    {"reabrir", {"object-unlocked", nullptr, nullptr}, Glyph::Unlock},
    {"importar", {"document-import", "document-open", nullptr}, Glyph::Import},
    {"predefinidos", {"view-list-details", "format-justify-left", nullptr}, Glyph::List},
    {"procurar", {"edit-find", "system-search", nullptr}, Glyph::Find},
    {"pesquisar", {"edit-find", "system-search", nullptr}, Glyph::Find},
    {"find", {"edit-find", "system-search", nullptr}, Glyph::Find},
}};

// Qt looks in the theme the platform names; without a desktop session that is often
// none at all, so fall back to a theme that is installed.
void ChooseIconTheme() {
  static bool chosen = false;
  if (chosen) return;
  chosen = true;
  if (!QIcon::themeName().isEmpty() && QIcon::themeName() != QStringLiteral("hicolor")) return;
  for (const QString& path : QIcon::themeSearchPaths())
    for (const char* theme : {"breeze", "Adwaita", "Tango", "oxygen"})
      if (QDir(path + QLatin1Char('/') + QLatin1String(theme)).exists()) {
        QIcon::setThemeName(QLatin1String(theme));
        return;
      }
}

QIcon FromTheme(std::initializer_list<QString> names) {
  ChooseIconTheme();
  for (const QString& name : names)
    if (!name.isEmpty() && QIcon::hasThemeIcon(name)) return QIcon::fromTheme(name);
  return {};
}

void DrawGlyph(QPainter& p, Glyph glyph, QChar letter) {
  p.setRenderHint(QPainter::Antialiasing);
  const QColor ink(60, 60, 70);
  p.setPen(QPen(ink, 1.2));
  switch (glyph) {
    case Glyph::Page: {
      QPainterPath page;
      page.moveTo(4, 1.5); page.lineTo(10, 1.5); page.lineTo(13, 4.5);
      page.lineTo(13, 14.5); page.lineTo(4, 14.5); page.closeSubpath();
      p.fillPath(page, Qt::white);
      p.drawPath(page);
      p.setPen(QPen(QColor(40, 150, 60), 2));
      p.drawLine(QPointF(8.5, 7), QPointF(8.5, 12));
      p.drawLine(QPointF(6, 9.5), QPointF(11, 9.5));
      break;
    }
    case Glyph::Folder:
    case Glyph::OpenFolder: {
      p.setBrush(QColor(236, 196, 90));
      p.drawRoundedRect(QRectF(1.5, 4.5, 13, 9.5), 1, 1);
      p.drawRect(QRectF(1.5, 3, 5, 2));
      if (glyph == Glyph::OpenFolder) {
        p.setBrush(QColor(250, 220, 120));
        QPolygonF flap{QPointF(3.5, 8), QPointF(15, 8), QPointF(13, 14), QPointF(1.5, 14)};
        p.drawPolygon(flap);
      }
      break;
    }
    case Glyph::Disk:
      p.setBrush(QColor(70, 110, 180));
      p.drawRoundedRect(QRectF(1.5, 1.5, 13, 13), 1.5, 1.5);
      p.setBrush(Qt::white);
      p.drawRect(QRectF(4, 2, 8, 5));
      p.setBrush(QColor(200, 200, 210));
      p.drawRect(QRectF(4.5, 10, 7, 4.5));
      break;
    case Glyph::Cross:
      p.setPen(QPen(QColor(200, 40, 40), 2.6, Qt::SolidLine, Qt::RoundCap));
      p.drawLine(QPointF(4, 4), QPointF(12, 12));
      p.drawLine(QPointF(12, 4), QPointF(4, 12));
      break;
    case Glyph::Check:
      p.setPen(QPen(QColor(30, 150, 50), 2.6, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
      p.drawPolyline(QPolygonF{QPointF(3, 8.5), QPointF(6.5, 12), QPointF(13, 4)});
      break;
    case Glyph::Unlock:
      p.setBrush(QColor(220, 170, 40));
      p.drawRoundedRect(QRectF(3, 7.5, 10, 7), 1, 1);
      p.setBrush(Qt::NoBrush);
      p.drawArc(QRectF(5, 1.5, 6, 9), 0, 180 * 16);
      break;
    case Glyph::Door:
      p.setBrush(QColor(150, 100, 60));
      p.drawRect(QRectF(3.5, 1.5, 9, 13));
      p.setBrush(QColor(240, 220, 120));
      p.drawEllipse(QPointF(10.5, 8.5), 1, 1);
      break;
    case Glyph::List:
      p.setPen(QPen(ink, 1.6));
      for (double y : {4.0, 8.0, 12.0}) {
        p.drawPoint(QPointF(3, y));
        p.drawLine(QPointF(6, y), QPointF(14, y));
      }
      break;
    case Glyph::Import:
      p.setBrush(QColor(225, 225, 232));
      p.drawRect(QRectF(1.5, 9.5, 13, 5));
      p.setPen(QPen(QColor(40, 110, 190), 2.2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
      p.drawLine(QPointF(8, 1.5), QPointF(8, 10));
      p.drawPolyline(QPolygonF{QPointF(4.5, 6.5), QPointF(8, 10), QPointF(11.5, 6.5)});
      break;
    case Glyph::Find:
      p.setPen(QPen(ink, 1.8));
      p.setBrush(QColor(210, 230, 250));
      p.drawEllipse(QPointF(6.5, 6.5), 4.5, 4.5);
      p.setPen(QPen(ink, 2.6, Qt::SolidLine, Qt::RoundCap));
      p.drawLine(QPointF(10, 10), QPointF(14, 14));
      break;
    case Glyph::Letter: {
      p.setBrush(QColor(90, 120, 170));
      p.setPen(Qt::NoPen);
      p.drawRoundedRect(QRectF(1, 1, 14, 14), 3, 3);
      p.setPen(Qt::white);
      QFont font = p.font();
      font.setBold(true);
      font.setPixelSize(10);
      p.setFont(font);
      p.drawText(QRectF(1, 1, 14, 14), Qt::AlignCenter, QString(letter));
      break;
    }
  }
}

QIcon Drawn(Glyph glyph, QChar letter) {
  QIcon icon;
  for (int size : {16, 24, 32}) {
    QPixmap pixmap(size, size);
    pixmap.fill(Qt::transparent);
    QPainter painter(&pixmap);
    painter.scale(size / 16.0, size / 16.0);
    DrawGlyph(painter, glyph, letter);
    painter.end();
    icon.addPixmap(pixmap);
  }
  return icon;
}

QChar InitialOf(const std::string& text) {
  for (QChar ch : ToQ(text))
    if (ch.isLetterOrNumber()) return ch.toUpper();
  return QLatin1Char('?');
}

}  // namespace

QIcon ToolbarIcon(const std::string& key, const std::string& caption) {
  for (const KnownKey& known : kKnownKeys) {
    if (known.key != key) continue;
    QIcon themed = FromTheme({QLatin1String(known.themeNames[0]),
                              QLatin1String(known.themeNames[1] ? known.themeNames[1] : ""),
                              QLatin1String(known.themeNames[2] ? known.themeNames[2] : "")});
    return themed.isNull() ? Drawn(known.glyph, QChar()) : themed;
  }
  QIcon themed = FromTheme({ToQ(key)});
  return themed.isNull() ? Drawn(Glyph::Letter, InitialOf(caption.empty() ? key : caption))
                         : themed;
}

QIcon PictureIcon(const std::string& name) {
  if (name.empty()) return {};
  QIcon themed = FromTheme({ToQ(name)});
  if (!themed.isNull()) return themed;
  // Names that say what they show get a drawing of it; the rest their first letter.
  QString lower = ToQ(name).toLower();
  if (lower.contains(QLatin1String("open")) || lower.contains(QLatin1String("aberta")))
    return Drawn(Glyph::OpenFolder, QChar());
  if (lower.contains(QLatin1String("folder")) || lower.contains(QLatin1String("pasta")))
    return Drawn(Glyph::Folder, QChar());
  if (lower.contains(QLatin1String("doc")) || lower.contains(QLatin1String("text")) ||
      lower.contains(QLatin1String("page")) || lower.contains(QLatin1String("folha")))
    return Drawn(Glyph::Page, QChar());
  return Drawn(Glyph::Letter, InitialOf(name));
}

}  // namespace dvqt
