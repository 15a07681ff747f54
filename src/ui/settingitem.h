#pragma once

#include "common/ui/selfpainted.h"

#include <QFrame>
#include <QStringList>

class QLabel;
class ValueLabel;

// A row of the settings panel: a caption and a value between two arrows. Select begins and ends the
// editing of the value, which Down increases and Up decreases; all other keys are left to the
// panel.
class SettingItem : public SelfPainted<QFrame>
{
    Q_OBJECT

public:
    enum Kind : int { Number = 0, Choice = 1 };

    // A plain text, in which the service's entities are undone.
    explicit SettingItem(const QString &caption, QWidget *parent = nullptr);

    // The texts of a choice, and what follows a number.
    void setChoices(const QStringList &choices);
    void setSuffix(const QString &suffix);

    // Not being edited any longer.
    void setValue(int kind, int value);
    int value() const { return mValue; }
    bool isEditing() const { return mIsEditing; }
    QString valueText() const;

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void focusInEvent(QFocusEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    void increase();
    void decrease();
    void setEditing(bool isEditing);
    void showFocus(bool hasFocus);
    void redraw();

    QLabel *mCaption;
    ValueLabel *mValueLabel;
    QStringList mChoices;
    QString mSuffix;
    int mKind = Number;
    int mValue = 0;
    bool mIsEditing = false;
};
