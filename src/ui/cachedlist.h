#pragma once

class Package;
struct PackageProperty;

// The cached list that can serve this page, or null, as from PackageManager::getPackage(). An
// answer that was no feed (an error page, say, that came without an error) counts as not there, and
// is dropped, so that the list is asked for anew.
Package *cachedList(PackageProperty &property);
