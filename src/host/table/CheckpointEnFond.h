// Copies the write-ahead log of an SQLite file into the file on a thread of its own.
//
// Internal to the SQLite store (src/host/table). SQLite's automatic checkpoint runs inside the
// commit that crosses its threshold, on the writer's time; a passive checkpoint from another
// connection needs no lock the writer holds, so the writer goes on while the pages are copied
// and the file synced. When the log has been copied whole, the writer's next transaction starts
// it again from the beginning. Failures are left to the next request: the writer checkpoints
// itself if the log keeps growing (see SqliteDatabase::surCommit).
//
// The object owns its thread and the thread's connection: the thread starts with the object
// and is stopped and joined by its destructor. demander() and faits() may be called from any
// thread; the database calls them from its own.
#pragma once

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <filesystem>
#include <mutex>
#include <stop_token>
#include <thread>

namespace quarvo::host {

class CheckpointEnFond {
 public:
  explicit CheckpointEnFond(std::filesystem::path path);
  // Stops the thread, after the copy in progress if any.
  ~CheckpointEnFond();
  CheckpointEnFond(const CheckpointEnFond&) = delete;
  CheckpointEnFond& operator=(const CheckpointEnFond&) = delete;

  // Asks for a copy of the log; requests made while one is waiting count once.
  void demander();
  // Copies completed so far.
  int64_t faits() const { return faits_.load(); }

 private:
  void boucle(std::stop_token stop);

  std::filesystem::path path_;
  std::mutex mutex_;
  std::condition_variable_any cv_;
  bool demande_ = false;
  std::atomic<int64_t> faits_{0};
  std::jthread thread_;  // last: it starts once the members above exist
};

}  // namespace quarvo::host
