#include "ui/upwidget.h"

#include "base/i18n.h"
#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QMap>

#include <algorithm>

namespace {

constexpr int kLongestName = 10000; // characters that are laid out at most
constexpr int kNameGap = 12;        // between the last entry and the name
constexpr QSize kLogo(192, 52);     // leaves room for the widest name between usual borders

void addSpacer(QHBoxLayout *row)
{
    row->addSpacerItem(new QSpacerItem(40, 20, QSizePolicy::Expanding, QSizePolicy::Fixed));
}

QHBoxLayout *makeRow()
{
    auto *row = new QHBoxLayout;
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(0);
    return row;
}

} // namespace

UpWidget::UpWidget(QWidget *parent)
    : QWidget(parent)
{
    setFocusPolicy(Qt::StrongFocus);
    QHBoxLayout *row = makeRow();
    setLayout(row);
    auto *logo = new QLabel(this);
    logo->setPixmap(loadPicture(QStringLiteral(":/res/orvala_icon_big.png"), kLogo));
    row->addWidget(logo);
    addSpacer(row);

    QHBoxLayout *titles = makeRow();
    titles->setAlignment(Qt::AlignBottom);
    addEntry(titles, I18n::title(0), false, &UpWidget::handleHomeEnterEvent);
    addEntry(titles, I18n::title(1), false, &UpWidget::handleMyPhotoEnterEvent);
    addEntry(titles, I18n::title(10), false, &UpWidget::handleFavoriteEnterEvent);
    addEntry(titles, I18n::title(2), false, &UpWidget::handleSearchEnterEvent);
    row->addLayout(titles);
    row->addWidget(makeUserColumn());
    restyle();
}

void UpWidget::addEntry(QHBoxLayout *row, const QString &text, bool signOut,
                        void (UpWidget::*slot)())
{
    auto *entry = new TitleIcon(text, signOut, this);
    connect(entry, &TitleIcon::pressEnter, this, slot);
    addSpacer(row);
    row->addWidget(entry);
    mEntries << entry;
}

QWidget *UpWidget::makeUserColumn()
{
    auto *column = new QWidget(this);
    auto *lines = new QVBoxLayout(column);
    lines->setContentsMargins(0, 0, 0, 0);
    lines->setSpacing(0);

    mUserName = new QLabel(column);
    mUserName->setTextFormat(Qt::PlainText);
    QFont font = mUserName->font();
    font.setBold(true);
    font.setPointSize(int(SystemConfig::titleFont() * 0.9));
    mUserName->setFont(font);
    mUserName->setContentsMargins(kNameGap, 0, 0, 0);
    mUserName->setAlignment(Qt::AlignRight);
    mUserName->setStyleSheet(QStringLiteral("color:#A2BBC9"));
    lines->addWidget(mUserName);

    QHBoxLayout *row = makeRow();
    addEntry(row, I18n::label(1), true, &UpWidget::handleLogoutEnterEvent);
    TitleIcon *signOut = mEntries.last();
    signOut->setFixedHeight(signOut->fontMetrics().height() * 2);
    lines->addLayout(row);
    return column;
}

void UpWidget::setUserName(const QString &name)
{
    if (!mUserName)
        return;
    const QString whole = name.left(kLongestName).simplified();
    const int usable =
        SystemConfig::mScreen_Width - SystemConfig::borderLeft() - SystemConfig::borderRight();
    const QFontMetrics metrics = mUserName->fontMetrics();
    const bool fits = metrics.horizontalAdvance(whole) < usable / 5;
    mUserName->setText(fits ? whole
                            : metrics.elidedText(whole, Qt::ElideRight, int(0.24 * usable)));
}

QString UpWidget::shownUserName() const
{
    return mUserName->text();
}

void UpWidget::returnToHome()
{
    setFocus();
    mPreviousFocus = mFocus;
    mPreviousSelected = mSelected;
    mFocus = mSelected = HomeEntry;
    handleHomeEnterEvent();
    restyle();
}

void UpWidget::cancelSignOut()
{
    if (mFocus == SignOutEntry) {
        mPreviousFocus = mFocus;
        mFocus = mSelected = mPreviousSelected;
    }
    restyle();
}

void UpWidget::updateFocusMark()
{
    mHasFocus = hasFocus();
    restyle();
}

void UpWidget::ask(int type, const QString &userId)
{
    PackageProperty property;
    property.mType = type;
    property.mUserId = userId;
    emit pressEnter(property);
}

void UpWidget::handleHomeEnterEvent()
{
    ask(TYPE_FEATURED_PHOTOS, QString());
}

void UpWidget::handleMyPhotoEnterEvent()
{
    ask(TYPE_ALBUM_LIST, QStringLiteral("default"));
}

void UpWidget::handleSearchEnterEvent()
{
    ask(TYPE_SEARCH_PHOTOS, QString());
}

void UpWidget::handleFavoriteEnterEvent()
{
    ask(TYPE_FAVORITE_PEOPLE, QStringLiteral("default"));
}

void UpWidget::handleLogoutEnterEvent()
{
    emit signOutRequested();
}

void UpWidget::keyPressEvent(QKeyEvent *event)
{
    switch (event->key()) {
    case DEVICE_LEFT_KEY:
        mPreviousFocus = mFocus;
        mFocus = std::max(0, mFocus - 1);
        break;
    case DEVICE_RIGHT_KEY:
        mPreviousFocus = mFocus;
        mFocus = std::min(mEntries.size() - 1, mFocus + 1);
        break;
    case DEVICE_SELECT_KEY:
        select(event);
        break;
    case DEVICE_PLAY_KEY:
    case DEVICE_PAGEUP_KEY:
    case DEVICE_PAGEDOWN_KEY:
    case DEVICE_RETURN_KEY:
    case DEVICE_RED_KEY:
    case DEVICE_PLAYPAUSE_KEY:
        emit keyPassedOn(event);
        event->accept();
        return;
    default:
        QWidget::keyPressEvent(event);
        return;
    }
    event->accept();
    restyle();
}

void UpWidget::select(QKeyEvent *event)
{
    mPreviousSelected = mSelected;
    mPreviousFocus = mFocus;
    mSelected = mFocus;
    mEntries.at(mFocus)->keyPressEvent(event);
}

void UpWidget::focusInEvent(QFocusEvent *event)
{
    QWidget::focusInEvent(event);
    mHasFocus = true;
    mFocus = mSelected;
    restyle();
}

void UpWidget::focusOutEvent(QFocusEvent *event)
{
    QWidget::focusOutEvent(event);
    mHasFocus = false;
    restyle();
}

// Entries that are not named keep the look they have; the looks are settled before any is set, so
// that no sheet is set twice.
void UpWidget::restyle()
{
    using Look = TitleIcon::Look;
    QMap<int, Look> looks{{mPreviousFocus, Look::Normal}, {mPreviousSelected, Look::Normal}};
    if (!mHasFocus) {
        looks[mFocus] = Look::Normal;
        looks[mSelected] = Look::Selected;
    } else if (mFocus == mSelected) {
        looks[mFocus] = Look::FocusedSelected;
    } else {
        if (mSelected != SignOutEntry || mFocus != HomeEntry)
            looks[mSelected] = Look::Selected;
        looks[mFocus] = Look::Focused;
    }
    for (auto entry = looks.cbegin(); entry != looks.cend(); ++entry)
        mEntries.at(entry.key())->setLook(entry.value());
}
