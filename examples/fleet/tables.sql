-- Rows of captures, as ventrik-decode --format rows gives them. A load is one attempt to bring a
-- capture in; its rows count once the capture stands in `captures` with that load, which is the
-- last that is written. What an attempt leaves behind that was cut short is never seen.

CREATE TABLE IF NOT EXISTS rows
(
    load UInt64,
    capture String,
    record UInt64,
    time String, -- ISO 8601 in UTC with microseconds: sorts as it stands
    second DateTime MATERIALIZED toDateTime(replaceOne(substring(time, 1, 19), 'T', ' '), 'UTC'),
    subscription Nullable(UInt32),
    technology String,
    code Nullable(String),
    version Nullable(UInt8),
    layout Nullable(String),
    section String,
    path String,
    index Nullable(UInt32),
    name String,
    number Nullable(Float64),
    unit Nullable(String),
    text Nullable(String)
)
ENGINE = MergeTree
PARTITION BY technology
ORDER BY (capture, path, time);

CREATE TABLE IF NOT EXISTS captures
(
    load UInt64,
    capture String,
    status String,
    offset Nullable(UInt64),
    reason Nullable(String),
    records UInt64,
    decoded UInt64,
    rows UInt64,
    bytes UInt64
)
ENGINE = ReplacingMergeTree(load)
ORDER BY capture;

-- What to ask: of each capture the rows of its last whole load.
CREATE VIEW IF NOT EXISTS loaded AS
SELECT load, capture, record, time, second, subscription, technology, code, version, layout,
       section, path, index, name, number, unit, text
FROM rows
WHERE (capture, load) IN (SELECT capture, max(load) FROM captures GROUP BY capture);
