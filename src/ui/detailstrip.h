#pragma once

#include "data/imagetarget.h"

#include <QWidget>

#include <memory>
#include <vector>

class StripCell;

// The strip of neighbours: a small picture of each, cut to one shape, with the photo shown marked.
class DetailStrip : public QWidget
{
    Q_OBJECT

public:
    explicit DetailStrip(QWidget *parent = nullptr);
    ~DetailStrip() override;

    // One neighbour; without an address its place stays dark, as for a photo not known yet.
    struct Neighbour
    {
        QString thumbnailUrl;
        bool isCurrent = false;
    };

    int places() const; // as many as the strip is wide for
    // Shows these photos and asks for the pictures that are not there yet.
    void showNeighbours(const QVector<Neighbour> &neighbours);
    // No picture is waited for any longer.
    void cancel();
    int pictureCount() const; // of the places that have their picture

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    std::vector<std::unique_ptr<StripCell>> mCells;
};
