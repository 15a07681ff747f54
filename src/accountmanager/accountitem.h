#pragma once

#include <QColor>
#include <QString>
#include <QWidget>

// One stored account in the list: its initial in a coloured disc, the display name and the e-mail
// address, each cut with an ellipsis where the row ends. It takes the focus and leaves every key to
// the page.
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

    QSize sizeHint() const override;

signals:
    void selectItem();

protected:
    void paintEvent(QPaintEvent *event) override;
    void mouseReleaseEvent(QMouseEvent *event) override;

private:
    void paintDisc(QPainter *painter) const;
    void paintTexts(QPainter *painter) const;

    QString mMail;
    QString mName;
};
