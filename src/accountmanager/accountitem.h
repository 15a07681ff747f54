#pragma once

#include <QColor>
#include <QString>
#include <QWidget>

class QAbstractButton;

// One stored account in the list: its initial in a coloured disc, the display name and the e-mail
// address, each cut with an ellipsis where the row's button Delete begins. Row and button take the
// focus and leave every key to the page.
class AccountItem : public QWidget
{
    Q_OBJECT

public:
    static constexpr int rowHeight = 66; // pixels

    AccountItem(const QString &mail, const QString &name, QWidget *parent = nullptr);

    QString mail() const { return mMail; }
    QString name() const { return mName; }
    // The first character of the name, or of the address without one; in capitals.
    static QString initialOf(const QString &text);
    // The same colour for an account at every start; white text on it is readable.
    static QColor colourOf(const QString &mail);

    void focusDelete();
    bool hasDeleteFocus() const;

    QSize sizeHint() const override;

signals:
    void selectItem();
    void clickedDelBut();

protected:
    void paintEvent(QPaintEvent *event) override;
    void mouseReleaseEvent(QMouseEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void paintDisc(QPainter *painter) const;
    void paintTexts(QPainter *painter) const;

    QString mMail;
    QString mName;
    QAbstractButton *mDelete;
};
