#include "history/DocumentIngest.h"

#include "history/ContentHash.h"
#include "history/InventoryState.h"
#include "history/StoredComponent.h"
#include "inventory/DocumentReader.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <atomic>
#include <condition_variable>
#include <deque>
#include <exception>
#include <mutex>
#include <thread>
#include <utility>

namespace history {

namespace {

// Below this many documents one thread reads them all: starting threads
// would cost more than it saves.
constexpr std::size_t gc_DocumentsPerThread = 64;
// Readings waiting for the database at most, so that memory stays bounded
// however many documents a run has.
constexpr std::size_t gc_WaitingResults = 256;

DocumentIngestResult::Reading readingOf(std::string const& bytes) {
    inventory::DocumentReading const reading = inventory::readDocument(bytes);
    DocumentIngestResult::Reading result;
    if (reading.isDefaultDocument()) {
        result.inventory = gc_InventoryDefault;
    } else {
        result.inventory = reading.isUnreadable() ? gc_InventoryUnreadable : gc_InventoryRead;
        result.components = encodeComponents(reading.components);
    }
    if (reading.isUnreadable()) {
        result.problem = reading.unreadableText();
    }
    return result;
}

// The results the reading threads hand over, and the first exception.
class ResultQueue {
public:
    void push(std::size_t index, DocumentIngestResult&& result) {
        std::unique_lock<std::mutex> lock(_mutex);
        _roomLeft.wait(lock, [this] { return _results.size() < gc_WaitingResults || _stopped; });
        _results.emplace_back(index, std::move(result));
        _ready.notify_one();
    }

    // False once every result was taken or the run stopped.
    bool pop(std::size_t total, std::pair<std::size_t, DocumentIngestResult>& taken) {
        std::unique_lock<std::mutex> lock(_mutex);
        _ready.wait(lock, [&] { return !_results.empty() || _stopped || _taken == total; });
        if (_stopped || _results.empty()) {
            return false;
        }
        taken = std::move(_results.front());
        _results.pop_front();
        ++_taken;
        _roomLeft.notify_one();
        return true;
    }

    void stop(std::exception_ptr failure) {
        std::lock_guard<std::mutex> const lock(_mutex);
        if (!_failure) {
            _failure = std::move(failure);
        }
        _stopped = true;
        _ready.notify_all();
        _roomLeft.notify_all();
    }

    bool isStopped() {
        std::lock_guard<std::mutex> const lock(_mutex);
        return _stopped;
    }

    std::exception_ptr failure() {
        std::lock_guard<std::mutex> const lock(_mutex);
        return _failure;
    }

private:
    std::mutex _mutex;
    std::condition_variable _ready;
    std::condition_variable _roomLeft;
    std::deque<std::pair<std::size_t, DocumentIngestResult>> _results;
    std::size_t _taken = 0;
    bool _stopped = false;
    std::exception_ptr _failure;
};

void readAll(DocumentIngest const& ingest, std::vector<std::string> const& paths,
             std::atomic<std::size_t>& next, ResultQueue& queue) {
    try {
        for (std::size_t index = next++; index < paths.size() && !queue.isStopped();
             index = next++) {
            queue.push(index, ingest.ingest(paths[index]));
        }
    } catch (...) {
        queue.stop(std::current_exception());
    }
}

} // namespace

DocumentIngest::DocumentIngest(std::unordered_set<std::string> const& knownHashes, unsigned threads)
    : _knownHashes(knownHashes), _threads(threads == 0 ? 1 : threads) {}

DocumentIngestResult DocumentIngest::ingest(std::string const& path) const {
    DocumentIngestResult result;
    std::string bytes;
    try {
        bytes = util::readWholeFile(path);
    } catch (util::SystemError const& error) {
        result.readFailure = error.what();
        return result;
    }
    result.hash = contentHash(bytes);
    if (_knownHashes.count(result.hash) == 0) {
        result.reading = readingOf(bytes);
    }
    return result;
}

void DocumentIngest::run(std::vector<std::string> const& paths, Delivery const& deliver) const {
    if (_threads == 1 || paths.size() < 2 * gc_DocumentsPerThread) {
        for (std::size_t index = 0; index < paths.size(); ++index) {
            deliver(index, ingest(paths[index]));
        }
        return;
    }
    ResultQueue queue;
    std::atomic<std::size_t> next{0};
    std::vector<std::thread> readers;
    std::pair<std::size_t, DocumentIngestResult> taken;
    try {
        for (unsigned thread = 0; thread < _threads; ++thread) {
            readers.emplace_back(readAll, std::cref(*this), std::cref(paths), std::ref(next),
                                 std::ref(queue));
        }
        while (queue.pop(paths.size(), taken)) {
            deliver(taken.first, std::move(taken.second));
        }
    } catch (...) {
        queue.stop(std::current_exception());
    }
    for (std::thread& reader : readers) {
        reader.join();
    }
    if (std::exception_ptr const failure = queue.failure()) {
        std::rethrow_exception(failure);
    }
}

} // namespace history
