-- What engineers ask of LTE captures. Run one after the other:
--     clickhouse-client --multiquery < queries.sql

-- Time on each cell, in seconds: from each change of the cell to the next one or the capture's end.
SELECT cell, sum(duration) AS seconds, uniq(capture) AS captures
FROM
(
    SELECT capture, groupArrayIf(shown, is_cell) AS cells,
           arrayPushBack(groupArrayIf(at, is_cell), max(at)) AS times
    FROM
    (
        SELECT capture, second AS at, ifNull(text, '') AS shown,
               path = '/Serving Cell Info/Physical Cell ID' AND number IS NOT NULL AS is_cell
        FROM loaded
        ORDER BY capture, time
    )
    GROUP BY capture
)
ARRAY JOIN cells AS cell,
           arrayMap((since, until) -> toUInt32(until) - toUInt32(since),
                    arrayPopBack(times), arrayPopFront(times)) AS duration
GROUP BY cell
ORDER BY seconds DESC, cell
LIMIT 10
FORMAT TSVWithNames;

-- How levels are spread on each channel, in dBm. A level is of the channel that was told last.
SELECT toUInt32(channels[place]) AS channel, count() AS levels,
       quantile(0.05)(level) AS weakest, quantile(0.5)(level) AS median,
       quantile(0.95)(level) AS strongest
FROM
(
    SELECT capture, groupArray(is_channel) AS flags, groupArray(value) AS values,
           arrayFilter((value, flag) -> flag, values, flags) AS channels,
           arrayCumSum(flags) AS places
    FROM
    (
        SELECT capture, name = 'E-ARFCN' AS is_channel, assumeNotNull(number) AS value
        FROM loaded
        WHERE path IN ('/Serving Cell Measurements/E-ARFCN',
                       '/Serving Cell Measurements/Measured RSRP')
              AND number IS NOT NULL
        ORDER BY capture, time, is_channel DESC
    )
    GROUP BY capture
)
ARRAY JOIN values AS level, flags AS flag, places AS place
WHERE NOT flag AND place > 0
GROUP BY channel
ORDER BY channel
FORMAT TSVWithNames;

-- Handovers and reselections an hour.
SELECT capture, cells - 1 AS changes, round(changes * 3600 / seconds, 1) AS an_hour
FROM
(
    SELECT capture, countIf(path = '/Serving Cell Info/Physical Cell ID'
                            AND number IS NOT NULL) AS cells,
           toUInt32(max(second)) - toUInt32(min(second)) AS seconds
    FROM loaded
    GROUP BY capture
)
WHERE cells > 0 AND seconds > 0
ORDER BY an_hour DESC, capture
LIMIT 10
FORMAT TSVWithNames;

-- The worst minutes: where the level was lowest.
SELECT capture, toStartOfMinute(second) AS minute, round(avg(number), 1) AS level
FROM loaded
WHERE path = '/Serving Cell Measurements/Measured RSRP' AND number IS NOT NULL
GROUP BY capture, minute
ORDER BY level, capture, minute
LIMIT 10
FORMAT TSVWithNames;
