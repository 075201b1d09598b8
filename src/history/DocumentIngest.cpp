#include "history/DocumentIngest.h"

#include "history/ContentHash.h"
#include "history/InventoryState.h"
#include "history/StoredComponent.h"
#include "inventory/DocumentReader.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <deque>
#include <exception>
#include <mutex>
#include <thread>
#include <utility>
#include <vector>

namespace history {

namespace {

// Below this many documents one thread reads them all: starting threads
// would cost more than it saves.
constexpr std::size_t gc_DocumentsPerThread = 64;
// Documents a reading thread reads before it hands them over.
constexpr std::size_t gc_BatchDocuments = 16;
// Batches waiting for the database at most (256 readings), so that memory
// stays bounded however many documents a run has.
constexpr std::size_t gc_WaitingBatches = 16;

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

// What a reading thread hands over at once: consecutive documents, so that
// threads wake each other once per batch rather than once per document.
using Batch = std::vector<std::pair<std::size_t, DocumentIngestResult>>;

// The batches the reading threads hand over, and the first exception.
class ResultQueue {
public:
    void push(Batch&& batch) {
        std::unique_lock<std::mutex> lock(_mutex);
        _roomLeft.wait(lock, [this] { return _batches.size() < gc_WaitingBatches || _stopped; });
        _batches.push_back(std::move(batch));
        _ready.notify_one();
    }

    // False once every batch was taken or the run stopped.
    bool pop(std::size_t batches, Batch& taken) {
        std::unique_lock<std::mutex> lock(_mutex);
        _ready.wait(lock, [&] { return !_batches.empty() || _stopped || _taken == batches; });
        if (_stopped || _batches.empty()) {
            return false;
        }
        taken = std::move(_batches.front());
        _batches.pop_front();
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
    std::deque<Batch> _batches;
    std::size_t _taken = 0;
    bool _stopped = false;
    std::exception_ptr _failure;
};

std::size_t batchCount(std::size_t documents) {
    return (documents + gc_BatchDocuments - 1) / gc_BatchDocuments;
}

void readAll(DocumentIngest const& ingest, std::vector<std::string> const& paths,
             std::atomic<std::size_t>& nextBatch, ResultQueue& queue) {
    try {
        for (std::size_t batch = nextBatch++;
             batch < batchCount(paths.size()) && !queue.isStopped(); batch = nextBatch++) {
            std::size_t const first = batch * gc_BatchDocuments;
            std::size_t const end = std::min(first + gc_BatchDocuments, paths.size());
            Batch results;
            results.reserve(end - first);
            for (std::size_t index = first; index < end; ++index) {
                results.emplace_back(index, ingest.ingest(paths[index]));
            }
            queue.push(std::move(results));
        }
    } catch (...) {
        queue.stop(std::current_exception());
    }
}

} // namespace

DocumentIngest::DocumentIngest(KnownDocuments const& known, unsigned threads)
    : _known(known), _threads(threads == 0 ? 1 : threads) {}

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
    result.known = _known.find(result.hash);
    if (result.known == nullptr) {
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
    std::atomic<std::size_t> nextBatch{0};
    std::vector<std::thread> readers;
    Batch taken;
    try {
        for (unsigned thread = 0; thread < _threads; ++thread) {
            readers.emplace_back(readAll, std::cref(*this), std::cref(paths), std::ref(nextBatch),
                                 std::ref(queue));
        }
        while (queue.pop(batchCount(paths.size()), taken)) {
            for (auto& [index, result] : taken) {
                deliver(index, std::move(result));
            }
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
