#include "data/imagetarget.h"

#include "data/download.h"

ImageTarget::~ImageTarget()
{
    Download::forget(this);
}
