#pragma once

#include <QFont>
#include <QVector>
#include <QWidget>

class DetailNotes;
struct DetailComment;
struct DetailPhoto;

// What is known about the photo: title, date, size, owner, caption, tags and the newest comments,
// as many as there is room for. All texts are plain, and cut where they do not fit. They are laid
// out when they change and then only drawn.
class DetailInformation : public QWidget
{
    Q_OBJECT

public:
    explicit DetailInformation(QWidget *parent = nullptr);

    // Position: where the photo stands in its list, as in "12/345".
    void showNotes(const DetailPhoto &photo, const DetailNotes &notes, const QString &position);
    QStringList texts() const; // as shown, from top to bottom

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    // A text with its look, and at most so many lines of it.
    struct Part
    {
        QString text;
        int pixels; // of the font
        bool isBold;
        QColor colour;
        int mostLines;
        int spaceAbove;
        QString picture; // to the left of it, "" for none
    };
    struct PlacedPart
    {
        QString text;
        QFont font;
        QColor colour;
        QRect area;
        QString picture;
    };

    void addFacts(const DetailPhoto &photo, const QString &position);
    void addTags(const DetailNotes &notes);
    void addComments(const DetailNotes &notes);
    void addComment(const DetailComment &comment, int mostLines);
    void layOut();

    QVector<Part> mParts;
    QVector<PlacedPart> mPlaced;
};
