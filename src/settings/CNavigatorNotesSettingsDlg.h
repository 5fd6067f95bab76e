#pragma once

#include <QString>
#include <QStringList>
#include <QWidget>

class CColorButton;
class QComboBox;
class QLineEdit;
class QPushButton;

// The Notes page of the settings dialog: the font, size, background colour and background
// image that every new note receives.
class CNavigatorNotesSettingsDlg final : public QWidget {
    Q_OBJECT
public:
    struct Options {
        QString font = QStringLiteral("Times New Roman");
        int fontSize = 12;
        // "r,g,b"; empty: no colour chosen.
        QString backgroundColor = QStringLiteral("255,255,255");
        QString backgroundImage;
    };

    // The sizes offered, in points.
    static const QList<int> kFontSizes;

    explicit CNavigatorNotesSettingsDlg(QWidget* parent = nullptr);

    // A font or size that the lists do not hold is shown greyed in its box and kept as it is
    // unless the user picks another.
    void SetOptions(const Options& options);
    Options GetOptions() const;

    // The picture filter of the browse dialog, as name filters.
    static QStringList PictureNameFilters();

private:
    void BrowseForImage();

    QComboBox* m_font;
    QComboBox* m_fontSize;
    CColorButton* m_backgroundColor;
    QLineEdit* m_backgroundImage;
    QPushButton* m_browse;
    // What the boxes started with, for the values the lists do not hold.
    Options m_initial;
};
