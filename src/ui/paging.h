#pragma once

// Page arithmetic of the home screen: plain functions. Start indexes and record numbers count from
// 1, indexes from 0.
namespace paging {

constexpr int pageSize = 8;
constexpr int blockSize = 100; // results that one search fetches

// Whether lists of that PackageType are search results, which are cut into blocks.
bool isSearch(int packageType);

// Stands for one page back or on, in place of a record number.
constexpr int onePage = -1;

struct Page
{
    bool exists = false;
    int startIndex = 1; // of its first record
};

// The page before or after the one at startIndex, or the page of a record number.
Page pageUp(int startIndex, int arg);
Page pageDown(int startIndex, int total, int arg);

// Index in its list of a cell's record. Further search results come in blocks: their list holds one
// block only.
int recordIndex(int packageType, int startIndex, int cell);

// The neighbouring block of search results, or the same when there is none.
int neighbourBlock(int block, bool next, int total);
int blockStart(int block);

} // namespace paging
