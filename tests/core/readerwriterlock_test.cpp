#include <oecore/core/exception.h>
#include <oecore/core/readerwriterlock.h>

#include <gtest/gtest.h>

#include "../errortext.h"

namespace {

const std::string ownsWriter = "The current thread already owns the writer lock.";
const std::string ownsReader = "The current thread already owns a reader lock.";

}  // namespace

TEST(ReaderWriterLock, NonRecursiveFormsRefuseToReenter) {
    OmbRef<OmbReaderWriterLock> lock(new OmbReaderWriterLock);
    lock->acquireReaderLock();
    EXPECT_EQ(errorOf([&] { lock->acquireReaderLock(); }), ownsReader);
    EXPECT_EQ(errorOf([&] { lock->acquireWriterLock(); }), ownsReader) << "no upgrade from read to write";
    EXPECT_EQ(errorOf([&] { lock->acquireRecursiveWriterLock(); }), ownsReader);
    lock->releaseReaderLock();

    lock->acquireWriterLock();
    EXPECT_TRUE(lock->hasWriterLock());
    EXPECT_EQ(errorOf([&] { lock->acquireWriterLock(); }), ownsWriter);
    EXPECT_EQ(errorOf([&] { lock->acquireReaderLock(); }), ownsWriter);
    EXPECT_EQ(errorOf([&] { lock->acquireRecursiveReaderLock(); }), ownsWriter);
    lock->releaseWriterLock();
    EXPECT_FALSE(lock->hasWriterLock());
}

TEST(ReaderWriterLock, RecursiveFormsCountTheirReleases) {
    OmbRef<OmbReaderWriterLock> lock(new OmbReaderWriterLock);
    lock->acquireRecursiveReaderLock();
    lock->acquireRecursiveReaderLock();
    lock->releaseReaderLock();
    EXPECT_EQ(errorOf([&] { lock->acquireWriterLock(); }), ownsReader) << "one read lock is still held";
    lock->releaseReaderLock();
    lock->acquireWriterLock();  // free again
    lock->acquireRecursiveWriterLock();
    lock->releaseWriterLock();
    EXPECT_TRUE(lock->hasWriterLock());
    lock->releaseWriterLock();
    EXPECT_FALSE(lock->hasWriterLock());
    EXPECT_THROW(lock->releaseWriterLock(), OmbXInvalidOperation);
    EXPECT_THROW(lock->releaseReaderLock(), OmbXInvalidOperation);
}

TEST(ReaderWriterLock, GuardsReleaseWhatTheyTook) {
    OmbRef<OmbReaderWriterLock> lock(new OmbReaderWriterLock);
    {
        OmbAcquireWriterLock writer(lock);
        OmbReuseWriterOrAcquireRecursiveReaderLock inner(lock);  // re-enters the write lock
        EXPECT_TRUE(lock->hasWriterLock());
    }
    EXPECT_FALSE(lock->hasWriterLock());
    {
        OmbAcquireReaderLock reader(lock);
        OmbReuseWriterOrAcquireRecursiveReaderLock inner(lock);  // a second, recursive read lock
        reader.release();
        reader.release();  // a second release does nothing
    }
    OmbAcquireWriterLock writer(lock);  // everything was released
    writer.release();
    writer.acquire();
    OmbAcquireReaderLock none{OmbRef<OmbReaderWriterLock>()};  // a null lock is simply not taken
}
