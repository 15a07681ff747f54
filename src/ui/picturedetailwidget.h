#pragma once

#include "data/packageproperty.h"
#include "network/errorcode.h"
#include "ui/detailnotes.h"
#include "ui/detailphoto.h"
#include "ui/detailwalk.h"

#include <QPair>
#include <QWidget>

enum class DetailAction;
enum class DetailCommand;
class DetailActions;
class DetailInformation;
class DetailPictures;
class DetailStage;
class DetailStrip;
class ZoomView;

// The photo screen: one photo of a list as large as there is room, what is known about it, its
// neighbours and what can be done with it.
//
//   showPhoto() -> DetailWalk -> DetailPhoto (a copy) -> thumbnail at once, then the large photo
//                                                     -> comments and tags, once the user stays
//   left, right -> held: shown; else downloaded here, and shown when it has come
//
// The list may leave the cache at any time; it is then fetched anew, and the photo shown found
// again in it. Keys that mean nothing here, among them Up from the photo, are left to the owner.
class PictureDetailWidget : public QWidget
{
    Q_OBJECT

public:
    explicit PictureDetailWidget(QWidget *parent = nullptr);
    ~PictureDetailWidget() override;

    // Shows a photo. The index is that of the record in the package, whose first record has this
    // number in the whole list (other than 1 for blocks of further search results only). A photo
    // opened by a key starts with the focus on the photo; otherwise all stays as it was.
    void showPhoto(int recordIndex, Package *package, bool isSelfPhoto, bool isEnterPress,
                   int firstNumber = 1);

    // The photo shown: its number in the whole list from 1 (0: none), its index in the package held
    // now, and its data.
    int number() const { return mWalk->number(); }
    int recordIndex() const { return mWalk->recordIndex(); }
    int total() const { return mWalk->total(); } // photos of the whole list, as far as is known
    const DetailPhoto &photo() const { return mWalk->photo(); }
    bool isSelfPhoto() const { return mIsSelfPhoto; }

    // The keys that do something now, with what they do, for a bar of hints.
    QList<QPair<int, QString>> keyHints() const;

    // Answer of the package manager, to all that this screen asks it for.
    static void downloadPackageCB(PackageProperty &property, ErrorCode code);

public slots:
    // Comments or tags have changed on the service: fetches them anew.
    void refreshNotes();
    // A page of the list has come to somebody else, who asked for it.
    void updateList(PackageProperty &property);

signals:
    void backSignal(int recordIndex);
    void showTagSignal();
    void showMoreCommentSignal();
    void addCommentSignal();
    void addTagSignal();
    // The photo now shown lies on another page, which begins with this number of the list; its
    // records are held already.
    void handleDetailPageChange(int startIndex, bool nextPage);
    void slidePlay(int recordIndex); // runs by itself
    void slideShow(int recordIndex); // stepped by hand
    // Comments or tags have come, or did not, whoever asked for them.
    void notesArrived(const PackageProperty &property, ErrorCode code);
    // Another photo, or another use of the keys.
    void viewChanged();

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;
    void showEvent(QShowEvent *event) override;
    void hideEvent(QHideEvent *event) override;
    void focusInEvent(QFocusEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;

private:
    enum class Zone { Photo, Actions };

    void connectWalk();
    void display();
    void showPictures();
    void showStrip();
    void showInformation();
    void fetchNotes();
    void perform(DetailCommand command);
    void run(DetailAction action);
    void openZoom();
    void setZone(Zone zone);
    void updateMarks();
    void layOut();

    static PictureDetailWidget *mWidgetInst;

    DetailWalk *mWalk;
    DetailNotes mNotes;
    bool mIsSelfPhoto = false;
    Zone mZone = Zone::Photo;

    DetailStage *mStage;
    DetailPictures *mPictures;
    DetailStrip *mStrip;
    DetailActions *mActions;
    DetailInformation *mInformation;
    ZoomView *mZoom;
};
