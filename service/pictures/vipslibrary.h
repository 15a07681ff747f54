#pragma once

#include <memory>
#include <string>
#include <vips/vips.h>

// Sets the picture library up for a server that brings its own threads; cheap after the first call.
// Every function here that touches a picture calls it.
void startVips();

// What the picture library last complained about, in one line; forgets it. The library keeps one
// text for all threads, so that under load it may tell of another thread's picture.
std::string takeVipsError();

struct GObjectUnref
{
    void operator()(gpointer object) const { g_object_unref(object); }
};
template <typename T>
using GObjectPtr = std::unique_ptr<T, GObjectUnref>;
