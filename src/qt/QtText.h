#pragma once
// The model speaks UTF-8 std::string, Qt speaks QString: the two conversions, in one
// place so that no accent is lost on the way.

#include <QString>
#include <string>
#include <string_view>

namespace dvqt {

inline QString ToQ(std::string_view text) {
  return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

inline std::string FromQ(const QString& text) { return text.toUtf8().toStdString(); }

// Positions in the model count characters (code points); QString counts UTF-16 units.
// They differ only past the Basic Multilingual Plane, but a caret must never land
// inside a surrogate pair.
inline int Utf16Index(const QString& text, int codePoints) {
  int units = 0;
  for (int seen = 0; seen < codePoints && units < text.size(); ++seen)
    units += text.at(units).isHighSurrogate() && units + 1 < text.size() ? 2 : 1;
  return units;
}

inline int CodePointIndex(const QString& text, int units) {
  int points = 0;
  for (int at = 0; at < units && at < text.size(); ++points)
    at += text.at(at).isHighSurrogate() && at + 1 < text.size() ? 2 : 1;
  return points;
}

}  // namespace dvqt
