#pragma once

class Package;
struct PackageProperty;

// The cached list that can serve this page, or null, as from PackageManager::getPackage(). What is
// of no use is dropped, so that the list is asked for anew: an answer that was no feed (an error
// page, say, that came without an error), and featured photos without their beginning, for only a
// page fetched ahead had come when the pages before it had grown stale.
Package *cachedList(PackageProperty &property);
