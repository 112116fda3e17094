#include "platform/qt/QtLocale.h"

#include <algorithm>

namespace cv::qtui {

namespace {

bool HasAmPmMarker(const QString& format) {
    bool quoted = false;
    for (const QChar c : format) {
        if (c == QLatin1Char('\'')) {
            quoted = !quoted;
        } else if (!quoted && (c == QLatin1Char('a') || c == QLatin1Char('A'))) {
            return true;
        }
    }
    return false;
}

// Drops the blanks (and a separator before milliseconds) that would be left
// dangling when a part of the format is removed.
void DropTrailing(QString& out, const QString& characters) {
    while (!out.isEmpty() && characters.contains(out.back())) {
        out.chop(1);
    }
}

// Copies a quoted literal starting at i, quotes included; returns the index
// after it. Two quotes in a row stand for one quote character.
qsizetype CopyQuoted(const QString& format, qsizetype i, QString& out) {
    out += format[i++];
    while (i < format.size()) {
        out += format[i];
        if (format[i++] == QLatin1Char('\'')) {
            if (i < format.size() && format[i] == QLatin1Char('\'')) {
                out += format[i++];
                continue;
            }
            break;
        }
    }
    return i;
}

}  // namespace

std::string QtLocale::ToWindowsFormat(const QString& qtFormat) {
    const bool twelveHour = HasAmPmMarker(qtFormat);
    QString out;
    qsizetype i = 0;
    while (i < qtFormat.size()) {
        const QChar c = qtFormat[i];
        if (c == QLatin1Char('\'')) {
            i = CopyQuoted(qtFormat, i, out);
            continue;
        }
        qsizetype run = 1;
        while (i + run < qtFormat.size() && qtFormat[i + run] == c) {
            ++run;
        }
        const char letter = c.toLatin1();
        if (letter == 'h' || letter == 'H') {
            const char hour = (letter == 'h' && twelveHour) ? 'h' : 'H';
            out += QString(std::min<qsizetype>(run, 2), QLatin1Char(hour));
        } else if (letter == 'a' || letter == 'A') {
            out += QLatin1String("tt");
            if (i + 1 < qtFormat.size() && qtFormat[i + 1].toLower() == QLatin1Char('p')) {
                ++run;
            }
        } else if (letter == 't') {
            DropTrailing(out, QStringLiteral(" "));
        } else if (letter == 'z') {
            DropTrailing(out, QStringLiteral(".,"));
        } else {
            out += QString(run, c);
        }
        i += run;
    }
    return out.trimmed().toStdString();
}

std::string QtLocale::DecimalSeparator() const {
    return locale_.decimalPoint().toStdString();
}

std::string QtLocale::GroupingSeparator() const {
    return locale_.groupSeparator().toStdString();
}

std::string QtLocale::LongTimeFormat() const {
    return ToWindowsFormat(locale_.timeFormat(QLocale::LongFormat));
}

std::string QtLocale::ShortDateFormat() const {
    return ToWindowsFormat(locale_.dateFormat(QLocale::ShortFormat));
}

}  // namespace cv::qtui
