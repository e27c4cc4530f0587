// SPDX-License-Identifier: MIT
#include "Measurements/StoreSchema.h"

namespace kestro {

const char* const kStoreTables = R"sql(
CREATE TABLE recording (
  id INTEGER PRIMARY KEY,
  sha256 TEXT NOT NULL,
  name TEXT NOT NULL,
  made_up TEXT,
  messages INTEGER NOT NULL,
  first_time_us INTEGER,
  last_time_us INTEGER
);
CREATE TABLE series (
  id INTEGER PRIMARY KEY,
  recording INTEGER NOT NULL REFERENCES recording(id),
  technology TEXT NOT NULL,
  section TEXT NOT NULL,
  key TEXT NOT NULL,
  item TEXT,
  unit TEXT,
  kind TEXT NOT NULL,
  quantity TEXT
);
CREATE TABLE measurement (
  series INTEGER NOT NULL REFERENCES series(id),
  time_us INTEGER NOT NULL,
  value REAL,
  text TEXT,
  message INTEGER NOT NULL,
  cell INTEGER REFERENCES cell(id),
  serving INTEGER,
  assumed INTEGER
);
CREATE TABLE cell (
  id INTEGER PRIMARY KEY,
  recording INTEGER NOT NULL REFERENCES recording(id),
  technology TEXT NOT NULL,
  name TEXT NOT NULL,
  cell_identity INTEGER,
  base_station INTEGER,
  sector INTEGER,
  channel INTEGER,
  physical_identity INTEGER,
  band TEXT,
  frequency_mhz REAL,
  area INTEGER,
  network TEXT,
  level_last REAL,
  level_least REAL,
  level_median REAL,
  level_greatest REAL,
  level_count INTEGER NOT NULL,
  quality_last REAL,
  quality_least REAL,
  quality_median REAL,
  quality_greatest REAL,
  quality_count INTEGER NOT NULL,
  first_seen_us INTEGER NOT NULL,
  last_seen_us INTEGER NOT NULL,
  serving_s REAL NOT NULL,
  assumed INTEGER NOT NULL
);
CREATE TABLE event (
  id INTEGER PRIMARY KEY,
  recording INTEGER NOT NULL REFERENCES recording(id),
  time_us INTEGER NOT NULL,
  kind TEXT NOT NULL,
  technology TEXT NOT NULL,
  subject TEXT,
  from_text TEXT,
  to_text TEXT,
  from_cell INTEGER REFERENCES cell(id),
  to_cell INTEGER REFERENCES cell(id),
  from_level REAL,
  to_level REAL,
  value REAL,
  told_by TEXT,
  connected_by TEXT,
  duration_s REAL,
  message INTEGER NOT NULL
);
CREATE TABLE position (
  recording INTEGER NOT NULL REFERENCES recording(id),
  time_us INTEGER NOT NULL,
  latitude REAL NOT NULL,
  longitude REAL NOT NULL,
  speed_kmh REAL,
  PRIMARY KEY (recording, time_us)
) WITHOUT ROWID;
)sql";

// A bare column beside max() is that of the row with the greatest value. Messages of one time keep
// their order by their numbers.
const char* const kStoreViews = R"sql(
CREATE VIEW serving AS
  WITH serving_value AS (
    SELECT series.recording, series.quantity, measurement.time_us / 1000000 AS second,
           measurement.cell, measurement.value, max(measurement.message) AS latest
    FROM measurement JOIN series ON series.id = measurement.series
    WHERE measurement.serving = 1
    GROUP BY series.recording, series.quantity, second
  )
  SELECT level.recording AS recording, level.second AS second,
         datetime(level.second, 'unixepoch') AS time,
         (SELECT latitude FROM position
          WHERE position.recording = level.recording
            AND position.time_us BETWEEN level.second * 1000000 AND level.second * 1000000 + 999999
          ORDER BY position.time_us LIMIT 1) AS latitude,
         (SELECT longitude FROM position
          WHERE position.recording = level.recording
            AND position.time_us BETWEEN level.second * 1000000 AND level.second * 1000000 + 999999
          ORDER BY position.time_us LIMIT 1) AS longitude,
         cell.technology AS technology, level.cell AS cell, cell.name AS name,
         level.value AS level, quality.value AS quality
  FROM serving_value AS level
  JOIN cell ON cell.id = level.cell
  LEFT JOIN serving_value AS quality
    ON quality.quantity = 'quality' AND quality.recording = level.recording
   AND quality.second = level.second AND quality.cell = level.cell
  WHERE level.quantity = 'level';
CREATE VIEW neighbours AS
  SELECT level_series.recording AS recording, level.time_us AS time_us, level.message AS message,
         cell.technology AS technology, level.cell AS cell, cell.name AS name,
         level.assumed AS assumed, level.value AS level,
         (SELECT quality.value
          FROM series AS quality_series JOIN measurement AS quality
            ON quality.series = quality_series.id AND quality.time_us = level.time_us
           AND quality.message = level.message
          WHERE quality_series.recording = level_series.recording
            AND quality_series.section = level_series.section
            AND quality_series.item IS level_series.item
            AND quality_series.quantity = 'quality') AS quality
  FROM measurement AS level
  JOIN series AS level_series ON level_series.id = level.series
  JOIN cell ON cell.id = level.cell
  WHERE level.serving = 0 AND level_series.quantity = 'level';
)sql";

const char* const kDropStoreIndexes = R"sql(
DROP INDEX IF EXISTS recording_by_sha256;
DROP INDEX IF EXISTS series_by_section;
DROP INDEX IF EXISTS measurement_by_series;
DROP INDEX IF EXISTS measurement_by_cell;
DROP INDEX IF EXISTS cell_by_recording;
DROP INDEX IF EXISTS event_by_time;
)sql";

const char* const kMakeStoreIndexes = R"sql(
CREATE UNIQUE INDEX recording_by_sha256 ON recording (sha256);
CREATE INDEX series_by_section ON series (recording, section, item, quantity);
CREATE INDEX measurement_by_series ON measurement (series, time_us);
CREATE INDEX measurement_by_cell ON measurement (cell, time_us) WHERE cell IS NOT NULL;
CREATE INDEX cell_by_recording ON cell (recording, technology, name);
CREATE INDEX event_by_time ON event (recording, time_us);
)sql";

}  // namespace kestro
