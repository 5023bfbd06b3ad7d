<?php
// php block_check.php
// The service passes whole blocks of "DateTime" records on when one regular
// expression (or a narrower one built from the block's first line) says every
// line is later than the client's date. That check must
// never pass a line that the line-by-line reading (the client's own rules)
// would hold back. Compares both on many dates and lines, some made to sit on
// the edges (equal dates, leap days, impossible days, hour 24, tabs), and
// prints each disagreement. Exit status 0 when there is none.
declare(strict_types=1);

require __DIR__ . '/../../../server/lib/records.php';

use Quorvel\Service as S;

mt_srand(20061);
$disagreements = 0;
$checked = 0;
$afterDates = ['2019-12-31 00:00:00', '2020-02-28 23:59:59', '2000-02-29 12:00:00', '1999-12-31 23:59:59',
    '2006-05-01 10:20:30', '2099-12-31 23:59:59', '2020-01-01 00:00:59', '1900-03-01 00:00:00'];
for ($i = 0; $i < 40; ++$i) {
    $afterDates[] = random_date();
}
foreach ($afterDates as $afterText) {
    $after = S\date_seconds((float) S\parse_date_text($afterText));
    $pattern = '/^' . S\later_than_pattern(S\format_iso_seconds($after)) . ',/m';
    $lines = lines_near($afterText);
    // The narrower check, built from a block's first line, must hold back the same lines.
    $prefixes = [];
    foreach (array_slice($lines, 0, 60) as $first) {
        $prefix = S\later_prefix_pattern(substr($first, 0, 19), S\format_iso_seconds($after));
        if ($prefix !== null) {
            $prefixes[] = '/^' . $prefix . ',/m';
        }
    }
    foreach ($lines as $line) {
        foreach ($prefixes as $prefix) {
            if (preg_match($prefix, $line) === 1 && !((S\line_seconds($line, S\DATE_TIME) ?? PHP_INT_MIN) > $after)) {
                ++$disagreements;
                echo "after $afterText the check $prefix passes \"$line\"\n";
            }
        }
        ++$checked;
        $fast = preg_match($pattern, $line) === 1;
        $seconds = S\line_seconds($line, S\DATE_TIME);
        $slow = $seconds !== null && $seconds > $after;
        // The block check may be stricter than the line-by-line way, never looser.
        if ($fast && !$slow) {
            ++$disagreements;
            echo "after $afterText the block check passes \"$line\"\n";
        }
        // For valid canonical lines both must agree, or blocks would never pass.
        if (!$fast && $slow && preg_match('/^\d{4}-\d\d-\d\d (?:[01]\d|2[0-3]):[0-5]\d:[0-5]\d,/', $line) === 1) {
            ++$disagreements;
            echo "after $afterText the block check holds back \"$line\"\n";
        }
    }
}
echo "$checked lines checked, $disagreements disagreements\n";
exit($disagreements === 0 ? 0 : 1);

function random_date(): string
{
    return sprintf('%04d-%02d-%02d %02d:%02d:%02d', mt_rand(1900, 2100), mt_rand(1, 12), mt_rand(1, 28),
        mt_rand(0, 23), mt_rand(0, 59), mt_rand(0, 59));
}

// Lines whose dates sit at and around a date, and some made to be awkward.
/** @return list<string> */
function lines_near(string $date): array
{
    $seconds = S\date_seconds((float) S\parse_date_text($date));
    $lines = [];
    foreach ([-86400 * 366, -86400, -3600, -60, -1, 0, 1, 59, 60, 3600, 86400, 86400 * 31, 86400 * 366] as $delta) {
        $lines[] = S\format_iso_seconds($seconds + $delta) . ',1';
    }
    for ($i = 0; $i < 40; ++$i) {
        $lines[] = random_date() . ',1';
        $lines[] = sprintf('%04d-%02d-%02d %02d:%02d:%02d,1', mt_rand(1895, 2105), mt_rand(0, 13), mt_rand(0, 32),
            mt_rand(0, 25), mt_rand(0, 60), mt_rand(0, 60));
    }
    $year = (int) substr($date, 0, 4);
    foreach ([$year - 1, $year, $year + 1, 1900, 2000, 2100, 2400] as $y) {
        foreach (['02-28', '02-29', '02-30', '04-30', '04-31', '11-31', '12-31'] as $day) {
            $lines[] = sprintf('%04d-%s 00:00:00,1', $y, $day);
        }
    }
    $lines[] = substr($date, 0, 10) . ' 24:00:00,1';
    $lines[] = $date . "\t1,2";
    $lines[] = '"' . $date . '",1';
    return $lines;
}
