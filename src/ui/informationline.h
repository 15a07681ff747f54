#pragma once

#include <QString>
#include <QWidget>

// The information line: a bold title and the position in the list, one font size larger than the
// rest. text() is the line as rich text; as it changes with every focus move it is painted straight
// from its two plain texts, which takes no document to be laid out.
class InformationLine : public QWidget
{
    Q_OBJECT

public:
    explicit InformationLine(QWidget *parent = nullptr);

    void setTexts(const QString &title, const QString &position);
    QString text() const;

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void layOut();

    QFont mBold;
    QString mTitle;
    QString mPosition;
    QString mShownTitle; // cut to the room it has
    int mPositionLeft = 0;
};
